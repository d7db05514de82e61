#pragma once

#include <cstddef>
#include <cstdint>

#include "qisysq/FileLooks.h"

namespace qixlatorlua {

// The last few descriptions of codes that the scripts have produced, with the looks at files on
// which they depend: the scripts give the same again as long as those show the same. Used by one
// thread at a time.
class KeptTexts {
  public:
    // The text that the scripts would produce now; null if that is not known.
    const char* find(std::int32_t code, std::uint32_t attributes) const;
    // Keeps a text that depends on these looks and on no other file. Long texts are not kept.
    void add(std::int32_t code, std::uint32_t attributes, const qisysq::LookList& looks,
             const char* text);

  private:
    static constexpr std::size_t maximumCount = 4;

    struct Entry {
        std::int32_t code;
        std::uint32_t attributes;
        qisysq::LookList looks;
        char text[512];
    };

    Entry entries[maximumCount];
    std::size_t count = 0;
    // Which one the next text replaces if there is no room.
    std::size_t oldest = 0;
};

}  // namespace qixlatorlua
