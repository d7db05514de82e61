#include "qixlator/reportFailure.h"

namespace qixlator {

qierr_Writer reportFailure(qierr_Status* status, std::int32_t code,
                           const qierr_SourcePosition& position) {
    if (!qierr_Status_setCodeNamed(status, code, position)) {
        return qierr_Writer{nullptr, nullptr, nullptr};
    }
    return qierr_Writer_beginObject(qierr_Status_writerAtEnd(status), "qixlator_debug");
}

}  // namespace qixlator
