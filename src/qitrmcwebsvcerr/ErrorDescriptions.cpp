#include "qitrmcwebsvcerr/ErrorDescriptions.h"

#include <map>

#include "qitrmcsharedcmn/Exceptions.h"

namespace nQITRMCWEBSVC100 {
namespace {

const std::map<std::string, std::string> descriptions = {
#include "ErrorDescriptionRows.inc"
};

}  // namespace

std::string getErrorDescription(const std::string& name) {
    const auto found = descriptions.find(name);
    if (found == descriptions.end()) {
        throw nQITRMCSHAREDCMN100::InternalError("Fail to get error description", QITRMC_HERE);
    }
    return found->second;
}

}  // namespace nQITRMCWEBSVC100
