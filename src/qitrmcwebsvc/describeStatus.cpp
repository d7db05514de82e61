#include "qitrmcwebsvc/describeStatus.h"

#include <cstdint>
#include <cstring>
#include <memory>
#include <string_view>

#include "common/utf8.h"
#include "qihtl/String.h"
#include "qitrmcsharedcmn/Exceptions.h"
#include "qixlator/json1.h"
#include "qixlator/qixlator.h"

namespace nQITRMCWEBSVC100 {

using nQITRMCSHAREDCMN100::ThrowingStatus;

namespace {

// Always English, and ADE number 2 (see qixlator.h).
constexpr std::uint32_t attributes = 0 | 2u << qixlator_adeShift;
constexpr std::uint32_t flags = qixlator::json1::includeStatic | qixlator::json1::includeDynamic |
                                qixlator::json1::includeNested;

struct EndSession {
    void operator()(qixlator::Session* session) const { qixlator_destroySession(session); }
};
using SessionOwner = std::unique_ptr<qixlator::Session, EndSession>;

SessionOwner openSession() {
    ThrowingStatus failure;
    return SessionOwner(qixlator_createSession(&failure));
}

void translate(qixlator::Session* session, const qierr_Status& status, qihtl::String* text) {
    ThrowingStatus failure;
    qixlator::json1::translateErrStatusToRawText(session, &status, attributes, flags, text,
                                                 &failure);
}

// Reads eight bytes at a time, since nearly every text is ASCII.
std::size_t asciiLength(std::string_view text) {
    std::size_t length = 0;
    std::uint64_t bytes = 0;
    while (text.size() - length >= sizeof bytes) {
        std::memcpy(&bytes, text.data() + length, sizeof bytes);
        if ((bytes & 0x8080808080808080) != 0) {
            break;
        }
        length += sizeof bytes;
    }
    while (length < text.size() && (text[length] & 0x80) == 0) {
        ++length;
    }
    return length;
}

// A text may quote bytes of a request or a file that are not valid UTF-8, which JSON does not
// allow. Each such byte is replaced by the replacement character.
std::string withValidUtf8(std::string_view text) {
    std::string valid;
    valid.reserve(text.size());
    while (!text.empty()) {
        const std::size_t length = asciiLength(text);
        valid += text.substr(0, length);
        text.remove_prefix(length);
        if (!text.empty()) {
            const common::Utf8Character character = common::takeCharacter(text);
            valid += character.isValid() ? character.bytes : "\xef\xbf\xbd";
        }
    }
    return valid;
}

}  // namespace

std::string describeStatus(const qierr_Status& status) {
    const SessionOwner session = openSession();
    if (session == nullptr) {
        return {};  // the failure is ignored during stack unwinding
    }
    qihtl::String text;
    translate(session.get(), status, &text);
    std::string line = withValidUtf8({text.c_str(), text.length()});
    for (std::size_t end = 0; (end = line.find('\n', end)) != std::string::npos;) {
        line[end] = ' ';
    }
    return line;
}

}  // namespace nQITRMCWEBSVC100
