#include "qitrmcwebsvc/describeStatus.h"

namespace nQITRMCWEBSVC100 {

std::string describeStatus(const qierr_Status&) {
    return {};
}

}  // namespace nQITRMCWEBSVC100
