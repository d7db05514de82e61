#include <algorithm>
#include <cstring>
#include <memory>

#include "harnesses.h"
#include "jsonz/jsonz.h"
#include "qierr/Status.h"
#include "qierr/Writer.h"
#include "qitrmcwebsvc/Json.h"
#include "qitrmcwebsvc/exponentGuard.h"

namespace {

using nQITRMCWEBSVC100::JsonDocument;

// A text in a block of exactly its size, so that a sanitizer notices a read past its NUL.
std::unique_ptr<char[]> exactCopy(std::string_view text) {
    auto copy = std::make_unique<char[]>(text.size() + 1);
    std::copy(text.begin(), text.end(), copy.get());
    return copy;
}

bool isJson(const char* text) {
    const auto safe = nQITRMCWEBSVC100::withSafeExponents(text);
    JsonDocument document;
    document.Parse<rapidjson::kParseIterativeFlag>(safe ? safe->c_str() : text);
    return !document.HasParseError();
}

void readString(const jsonz_value& value) {
    if (value.type != jsonz_typeString) {
        return;
    }
    auto output = std::make_unique<char[]>(value.length + 1);
    const char* const end = jsonz_unescape(value.text, value.length, output.get());
    fuzz::require(end == nullptr || *end == '\0', "an unescaped text has no end");
    jsonz_equals(value.text, value.length, output.get());
}

// Reads the text with every function. Returns whether the whole text is accepted.
void read(const char* text) {
    jsonz_value value;
    const char* const end = jsonz_readValue(text, &value);
    const char* const last = text + std::strlen(text);
    fuzz::require(end == nullptr || (text < end && end <= last), "the value ends elsewhere");
    fuzz::require((end == nullptr) == (value.type == jsonz_typeFailure), "no value and no fault");
    fuzz::require(end != nullptr || !isJson(text), "a sound text was refused");
    readString(value);
    jsonz_getInt(text, 7);
    std::size_t length = 0;
    jsonz_getString(text, nullptr, &length);
    jsonz_endOfContainer(text);
    for (const char* key : {"", "translator", "translator_info", "a"}) {
        if (const char* const found = jsonz_findMember(text, key)) {
            fuzz::require(text < found && found <= last, "a member lies elsewhere");
        }
    }
    int elements = 0;
    for (const char* at = jsonz_firstElement(text); at != nullptr && elements < 1000; ++elements) {
        jsonz_value element;
        if (jsonz_readValue(at, &element) == nullptr) {
            break;
        }
        readString(element);
        at = jsonz_nextElement(jsonz_readValue(at, nullptr));
    }
}

void requireSoundBuffer(const qierr_Status& status) {
    if (status.json == nullptr) {
        return;
    }
    const std::size_t length = std::strlen(status.json);
    fuzz::require(length + 2 <= status.capacity, "no room for the end of the text");
    const char* const last = status.json + status.capacity - 1;
    fuzz::require(*last == 'J', "the end marker is gone");
    fuzz::require(
        std::all_of<const char*>(status.json + length, last, [](char c) { return c == '\0'; }),
        "the room behind the text is not empty");
}

void edit(const char* text, const char* addition) {
    qierr::Status status;
    qierr_Status_setCode(&status, -1);
    qierr_Status_setJson(&status, text);
    const bool wasJson = status.json == nullptr || isJson(status.json);
    requireSoundBuffer(status);

    qierr_Writer writer = qierr_orderedData("mxlator_qitrmc", &status);
    writer = addUsageString(writer, "kUsageTypeDetails", addition);
    writer = addUsageUInt32(writer, addition, 4294967295);
    writer = addUsageStringArray(writer, "kUsageTypeDetails", {addition, "", addition});
    addComment(writer, addition);
    requireSoundBuffer(status);
    // An array takes no members.
    const qierr_Writer atEnd = qierr_Status_writerAtEnd(&status);
    if (atEnd.pos != nullptr && *atEnd.pos == '}') {
        qierr_Writer_addString(atEnd, addition, addition);
    }
    requireSoundBuffer(status);
    fuzz::require(!wasJson || isJson(status.json), "a sound text was spoilt");
}

}  // namespace

void fuzz::editStatus(std::string_view input) {
    const std::size_t nul = std::min(input.find('\0'), input.size());
    const std::string_view rest = input.substr(std::min(nul + 1, input.size()));
    const auto text = exactCopy(input.substr(0, nul));
    const auto addition = exactCopy(rest.substr(0, rest.find('\0')));
    read(text.get());
    edit(text.get(), addition.get());
}
