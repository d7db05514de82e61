#pragma once

#include "qihtl/String.h"

// Formatting of the items of a json1 text, with the prefixes and suffixes of their parts.
namespace qixlator::json1 {

// The texts before and after the sections of one error's text. Null means empty.
struct SectionFormat {
    const char* staticPrefix = nullptr;
    const char* staticSuffix = nullptr;
    const char* dynamicPrefix = nullptr;
    const char* dynamicSuffix = nullptr;
    const char* debugPrefix = nullptr;
    const char* debugSuffix = nullptr;
};

// The texts before and after the parts of one item. Null means empty.
struct ItemFormat {
    const char* itemPrefix = nullptr;
    const char* itemSuffix = nullptr;
    const char* keyPrefix = nullptr;
    const char* keySuffix = nullptr;
    const char* valuePrefix = nullptr;
    const char* valueSuffix = nullptr;
    const char* elementPrefix = nullptr;
    const char* elementSuffix = nullptr;
    const char* elementSeparator = nullptr;
};

// The format of the items of one type. A table of these ends with a null type, whose format applies
// to every other type.
struct TypedItemFormat {
    const char* type;
    ItemFormat format;
};

extern const SectionFormat sectionFormat;
extern const TypedItemFormat rawItemFormats[];
extern const TypedItemFormat formattedItemFormats[];

// Appends the items of the JSON array at `array`, either all or none. Anything but an array has no
// items. qiapalerr_invalidParameter for an item that is not an object, or whose value is neither a
// string nor an array of strings.
void formatDynamicReportItems(const char* array, const TypedItemFormat* formats,
                              qihtl::String* output, qierr_Status* status);

}  // namespace qixlator::json1
