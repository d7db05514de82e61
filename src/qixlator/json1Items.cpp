#include "qixlator/json1Items.h"

#include "jsonz/jsonz.h"
#include "qixlator/jsonText.h"
#include "qixlator/reportFailure.h"

namespace qixlator::json1 {

namespace {

constexpr SectionFormat makeSectionFormat() {
    SectionFormat format;
    format.staticSuffix = "\n";
    format.dynamicSuffix = "\n";
    return format;
}

constexpr ItemFormat makeRawFormat() {
    ItemFormat format;
    format.itemPrefix = "\n";
    format.keySuffix = ": ";
    format.elementSeparator = ", ";
    return format;
}

constexpr ItemFormat makeFormattedFormat() {
    ItemFormat format;
    format.itemPrefix = "\n";
    format.keyPrefix = "<B>";
    format.keySuffix = ": </B>";
    format.elementSeparator = ", ";
    return format;
}

constexpr ItemFormat makeFormattedElaboration() {
    ItemFormat format;
    format.itemPrefix = "\n<B>";
    format.itemSuffix = "</B>";
    format.elementSeparator = ", ";
    return format;
}

}  // namespace

const SectionFormat sectionFormat = makeSectionFormat();

const TypedItemFormat rawItemFormats[] = {
    {"elaboration", {}},
    {nullptr, makeRawFormat()},
};

const TypedItemFormat formattedItemFormats[] = {
    {"elaboration", makeFormattedElaboration()},
    {nullptr, makeFormattedFormat()},
};

namespace {

// Formats the items of one array.
struct ItemLayout {
    const char* array;
    qihtl::String* output;
    qierr_Status* status;

    void fail(const char* what, const char* value) const;
    void failOnType(jsonz_type type) const;
    void element(const char* position, const ItemFormat& format) const;
    void elements(const char* position, const ItemFormat& format) const;
    void value(const char* position, const ItemFormat& format) const;
    void item(const char* position, const TypedItemFormat* formats) const;
};

void ItemLayout::fail(const char* what, const char* value) const {
    // The texts are copied before the failure is set, since copying does nothing once the status is
    // negative.
    qierr::Status copyStatus;
    qihtl::String arrayText;
    qihtl::String valueText;
    appendJsonText(array, &arrayText, &copyStatus);
    if (value != nullptr) {
        appendJsonText(value, &valueText, &copyStatus);
    }
    qierr_Writer writer = reportFailure(status, qiapalerr_invalidParameter,
                                        QIERR_HERE_NAMED("qiapalerr_invalidParameter"));
    writer = qierr_Writer_addString(writer, "formatDynamicReportItems", what);
    writer = qierr_Writer_addString(writer, "json1DynamicObjectBegin", arrayText.c_str());
    if (value != nullptr) {
        qierr_Writer_addString(writer, "value", valueText.c_str());
    }
}

void ItemLayout::failOnType(jsonz_type type) const {
    qierr_Writer writer = reportFailure(status, qiapalerr_invalidParameter,
                                        QIERR_HERE_NAMED("qiapalerr_invalidParameter"));
    writer = qierr_Writer_addString(writer, "formatDynamicReportItems",
                                    "json1 dynamic object invalid. value can only be string");
    qierr_Writer_addInt(writer, "value type", type);
}

void ItemLayout::element(const char* position, const ItemFormat& format) const {
    jsonz_value read;
    jsonz_readValue(position, &read);
    output->append(format.elementPrefix, status);
    if (read.type != jsonz_typeString) {
        failOnType(read.type);
        return;
    }
    appendJsonString(position, output, status);
    output->append(format.elementSuffix, status);
}

void ItemLayout::elements(const char* position, const ItemFormat& format) const {
    const char* next = jsonz_firstElement(position);
    while (next != nullptr && status->code >= 0) {
        element(next, format);
        next = jsonz_nextElement(jsonz_readValue(next, nullptr));
        if (next != nullptr) {
            output->append(format.elementSeparator, status);
        }
    }
}

void ItemLayout::value(const char* position, const ItemFormat& format) const {
    jsonz_value read;
    if (jsonz_readValue(position, &read) == nullptr) {
        fail("json1 dynamic object invalid. something's wrong with value item", position);
        return;
    }
    output->append(format.valuePrefix, status);
    if (read.type == jsonz_typeArray) {
        elements(position, format);
    } else {
        element(position, format);
    }
    output->append(format.valueSuffix, status);
}

const ItemFormat& formatFor(const qihtl::String& type, const TypedItemFormat* formats) {
    while (formats->type != nullptr && !type.equals(formats->type)) {
        ++formats;
    }
    return formats->format;
}

void ItemLayout::item(const char* position, const TypedItemFormat* formats) const {
    qihtl::String type;
    appendJsonString(jsonz_findMember(position, "type"), &type, status);
    const ItemFormat& format = formatFor(type, formats);
    output->append(format.itemPrefix, status);
    qihtl::String key;
    appendJsonString(jsonz_findMember(position, "key"), &key, status);
    if (!key.empty()) {
        output->append(format.keyPrefix, status);
        output->append(key.c_str(), key.length(), status);
        output->append(format.keySuffix, status);
    }
    const char* found = jsonz_findMember(position, "value");
    if (found != nullptr) {
        value(found, format);
    }
    output->append(format.itemSuffix, status);
}

}  // namespace

void formatDynamicReportItems(const char* array, const TypedItemFormat* formats,
                              qihtl::String* output, qierr_Status* status) {
    qihtl::String text;
    const ItemLayout layout{array, &text, status};
    const char* position = jsonz_firstElement(array);
    while (position != nullptr && status->code >= 0) {
        jsonz_value read;
        const char* end = jsonz_readValue(position, &read);
        // An item with an invalid value is still formatted, since that reports the value.
        if (*position == '{') {
            layout.item(position, formats);
        }
        if (read.type != jsonz_typeObject && status->code >= 0) {
            layout.fail("json1 dynamic object invalid. each array item must be an object", nullptr);
        }
        position = jsonz_nextElement(end);
    }
    output->append(text.c_str(), text.length(), status);
}

}  // namespace qixlator::json1
