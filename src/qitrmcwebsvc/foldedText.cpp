#include "qitrmcwebsvc/foldedText.h"

#include <utf8proc.h>

#include <array>
#include <cstddef>

#include "common/utf8.h"

namespace nQITRMCWEBSVC100 {
namespace {

// The folded code points of a text, one at a time.
class FoldedCodePoints {
  public:
    explicit FoldedCodePoints(std::string_view source) : text(source) {}

    bool atEnd() const { return next == count && text.empty(); }

    utf8proc_int32_t take() {
        if (next == count) {
            foldOne();
        }
        return folded[next++];
    }

  private:
    // Greater than the last code point of Unicode, so that an invalid byte equals no character.
    static constexpr utf8proc_int32_t strayByteBase = 0x110000;

    void foldOne() {
        next = 0;
        count = 1;
        const common::Utf8Character character = common::takeCharacter(text);
        if (!character.isValid()) {
            folded[0] = strayByteBase + static_cast<unsigned char>(character.bytes.front());
            return;
        }
        int boundary = 0;
        count = static_cast<std::size_t>(utf8proc_decompose_char(
            character.codePoint, folded.data(), static_cast<utf8proc_ssize_t>(folded.size()),
            UTF8PROC_CASEFOLD, &boundary));
    }

    std::string_view text;
    std::array<utf8proc_int32_t, 4> folded{};
    std::size_t next = 0;
    std::size_t count = 0;
};

bool isAscii(char c) {
    return static_cast<unsigned char>(c) < 0x80;
}

char foldAscii(char c) {
    return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
}

// Removes the common prefix of ASCII characters, for which folding is a matter of single bytes.
// Returns false if the texts differ there.
bool dropEqualAscii(std::string_view& left, std::string_view& right) {
    std::size_t same = 0;
    while (same < left.size() && same < right.size() && isAscii(left[same]) &&
           isAscii(right[same])) {
        if (foldAscii(left[same]) != foldAscii(right[same])) {
            return false;
        }
        ++same;
    }
    left.remove_prefix(same);
    right.remove_prefix(same);
    return true;
}

}  // namespace

bool equalFolded(std::string_view left, std::string_view right) {
    if (!dropEqualAscii(left, right)) {
        return false;
    }
    FoldedCodePoints leftPoints(left);
    FoldedCodePoints rightPoints(right);
    while (!leftPoints.atEnd() && !rightPoints.atEnd()) {
        if (leftPoints.take() != rightPoints.take()) {
            return false;
        }
    }
    return leftPoints.atEnd() && rightPoints.atEnd();
}

// FNV-1a of the folded code points.
std::uint32_t hashFolded(std::string_view text) {
    std::uint32_t hash = 2166136261U;
    const auto add = [&hash](std::uint32_t codePoint) { hash = (hash ^ codePoint) * 16777619U; };
    while (!text.empty() && isAscii(text.front())) {
        add(static_cast<unsigned char>(foldAscii(text.front())));
        text.remove_prefix(1);
    }
    FoldedCodePoints others(text);
    while (!others.atEnd()) {
        add(static_cast<std::uint32_t>(others.take()));
    }
    return hash;
}

}  // namespace nQITRMCWEBSVC100
