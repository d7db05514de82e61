#pragma once

#include <cstdint>
#include <memory>

#include "qitrmcwebsvc/RequestResource.h"
#include "qitrmcwebsvc/SessionContext.h"

namespace nQITRMCWEBSVC100 {

// Whether the one device that the resources name is of this product category, as the driver numbers
// categories. The session's default devices count as one name.
//
// Throws BasicError invalidParams unless the resources are exactly one device; qierr::Exception
// when the driver refuses to tell.
bool isDeviceOfCategory(const RequestResource& resource,
                        const std::shared_ptr<SessionContext>& session, std::int32_t category);

}  // namespace nQITRMCWEBSVC100
