#include "qixlator/jsonText.h"

#include <cstring>

#include "jsonz/jsonz.h"

namespace qixlator {

void appendJsonString(const char* position, qihtl::String* output, qierr_Status* status) {
    std::size_t length = 0;
    const char* text = jsonz_getString(position, "", &length);
    const std::uint32_t start = output->length();
    if (length == 0 || status->code < 0) {
        return;
    }
    if (length > 0x7FFFFFFF - start) {
        qihtl_reportMemoryFull(status);
        return;
    }
    output->resize(start + static_cast<std::uint32_t>(length), status);
    if (status->code < 0) {
        return;
    }
    char* decoded = output->data() + start;
    const char* end = jsonz_unescape(text, length, decoded);
    const std::size_t decodedLength =
        end == nullptr ? std::strlen(decoded) : static_cast<std::size_t>(end - decoded);
    output->resize(start + static_cast<std::uint32_t>(decodedLength), status);
}

void appendJsonText(const char* position, qihtl::String* output, qierr_Status* status) {
    const char* end = jsonz_readValue(position, nullptr);
    if (end == nullptr) {
        output->append(position, status);
    } else {
        output->append(position, static_cast<std::uint32_t>(end - position), status);
    }
}

}  // namespace qixlator
