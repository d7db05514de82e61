#pragma once

#include <cstdint>
#include <memory>

#include "qitrmcwebsvc/RequestResource.h"
#include "qitrmcwebsvc/SessionContext.h"

namespace nQITRMCWEBSVC100 {

// Whether the device that the resources name has this product category; the driver defines the
// numbers. The session's default devices count as one name.
//
// Throws BasicError invalidParams unless the resources are exactly one device; qierr::Exception if
// the driver cannot read the category.
bool isDeviceOfCategory(const RequestResource& resource,
                        const std::shared_ptr<SessionContext>& session, std::int32_t category);

}  // namespace nQITRMCWEBSVC100
