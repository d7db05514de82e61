#include "jsonz/jsonz.h"
#include "qierr/Writer.h"

// The details that a translator formats: entries of the array translator_info.ordered_data.

namespace {

qierr_Writer writerAt(const char* pos, qierr_Status* status) {
    return {const_cast<char*>(pos), qierr_Status_growJson, status};
}

bool isString(const char* position, const char* plain) {
    jsonz_value value;
    jsonz_readValue(position, &value);
    return value.type == jsonz_typeString && jsonz_equals(value.text, value.length, plain);
}

// The closing bracket of the container at `position` if it begins with `bracket`; otherwise null.
const char* endOf(char bracket, const char* position) {
    return *position == bracket ? jsonz_endOfContainer(position) : nullptr;
}

qierr_Writer openOrderedData(qierr_Writer inInfo) {
    return qierr_Writer_beginArray(inInfo, "ordered_data");
}

qierr_Writer openInfo(qierr_Writer atEnd) {
    return openOrderedData(qierr_Writer_beginObject(atEnd, "translator_info"));
}

qierr_Writer beginEntry(qierr_Writer writer, const char* type) {
    writer = qierr_Writer_beginObject(writer, nullptr);
    return qierr_Writer_addString(writer, "type", type);
}

qierr_Writer beginUsage(qierr_Writer writer, const char* tag) {
    return qierr_Writer_addString(beginEntry(writer, "usage"), "usage", tag);
}

qierr_Writer endUsage(qierr_Writer writer, const char* valueType) {
    writer = qierr_Writer_addString(writer, "value_type", valueType);
    return qierr_Writer_endObject(writer);
}

}  // namespace

qierr_Writer qierr_orderedData(const char* translatorName, qierr_Status* status) {
    const qierr_Writer nowhere = writerAt(nullptr, status);
    qierr_Writer atEnd = qierr_Status_writerAtEnd(status);
    if (atEnd.pos == nullptr || *atEnd.pos != '}') {
        return nowhere;
    }
    const char* translator = jsonz_findMember(status->json, "translator");
    if (translator == nullptr) {
        return openInfo(qierr_Writer_addString(atEnd, "translator", translatorName));
    }
    if (!isString(translator, translatorName)) {
        return nowhere;
    }
    const char* info = jsonz_findMember(status->json, "translator_info");
    if (info == nullptr) {
        return openInfo(atEnd);
    }
    const char* orderedData = jsonz_findMember(info, "ordered_data");
    if (orderedData == nullptr) {
        return openOrderedData(writerAt(endOf('{', info), status));
    }
    return writerAt(endOf('[', orderedData), status);
}

qierr_Writer addUsageString(qierr_Writer writer, const char* tag, const char* value) {
    writer = qierr_Writer_addString(beginUsage(writer, tag), "value", value);
    return endUsage(writer, "string");
}

qierr_Writer addUsageUInt32(qierr_Writer writer, const char* tag, std::uint32_t value) {
    writer = qierr_Writer_addUInt(beginUsage(writer, tag), "value", value);
    return endUsage(writer, "uint32_t");
}

qierr_Writer addUsageStringArray(qierr_Writer writer, const char* tag,
                                 const std::vector<std::string>& values) {
    writer = qierr_Writer_beginArray(beginUsage(writer, tag), "value");
    for (const std::string& value : values) {
        writer = qierr_Writer_addString(writer, nullptr, value.c_str());
    }
    return endUsage(qierr_Writer_endArray(writer), "string");
}

qierr_Writer addComment(qierr_Writer writer, const char* text) {
    writer = qierr_Writer_addString(beginEntry(writer, "comment"), "comment", text);
    return qierr_Writer_endObject(writer);
}
