#include "qixlatorlua/KeptTexts.h"

#include <cstring>

namespace qixlatorlua {

const char* KeptTexts::find(std::int32_t code, std::uint32_t attributes) const {
    for (std::size_t index = 0; index < count; ++index) {
        const Entry& entry = entries[index];
        if (entry.code == code && entry.attributes == attributes && entry.looks.isRepeated()) {
            return entry.text;
        }
    }
    return nullptr;
}

void KeptTexts::add(std::int32_t code, std::uint32_t attributes, const qisysq::LookList& looks,
                    const char* text) {
    const std::size_t size = std::strlen(text) + 1;
    if (!looks.isComplete || size > sizeof entries[0].text) {
        return;
    }
    Entry* entry = nullptr;
    for (std::size_t index = 0; index < count && entry == nullptr; ++index) {
        const bool isSame = entries[index].code == code && entries[index].attributes == attributes;
        entry = isSame ? &entries[index] : nullptr;
    }
    if (entry == nullptr && count < maximumCount) {
        entry = &entries[count++];
    } else if (entry == nullptr) {
        entry = &entries[oldest];
        oldest = (oldest + 1) % maximumCount;
    }
    entry->code = code;
    entry->attributes = attributes;
    entry->looks = looks;
    std::memcpy(entry->text, text, size);
}

}  // namespace qixlatorlua
