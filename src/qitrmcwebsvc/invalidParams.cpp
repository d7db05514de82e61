#include "qitrmcwebsvc/invalidParams.h"

#include "qitrmcsharedcmn/Exceptions.h"
#include "qitrmcwebsvcerr/ErrorDescriptions.h"

namespace nQITRMCWEBSVC100 {

void throwInvalidParams(const char* descriptionName, const qierr_SourcePosition& position) {
    nQITRMCSHAREDCMN100::BasicError error(qierr::codes::invalidParams, position);
    addUsageString(error.details(), "kUsageTypeDetails",
                   getErrorDescription(descriptionName).c_str());
    throw error;
}

}  // namespace nQITRMCWEBSVC100
