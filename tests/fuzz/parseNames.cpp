#include <algorithm>
#include <optional>

#include "harnesses.h"
#include "qitrmcsharedcmn/Exceptions.h"
#include "qitrmcsharedcmn/parseUtilities.h"

namespace {

using namespace nQITRMCSHAREDCMN100;
using Names = std::vector<std::string>;

// The result of `work`, or nothing when it refuses the names, which is allowed.
template <typename Work>
auto unlessRefused(Work work) -> std::optional<decltype(work())> {
    try {
        return work();
    } catch (const BasicError& error) {
        const std::int32_t code = error.status()->code;
        fuzz::require(code == -250828 || code == -250832, "refused with a wrong code");
        return std::nullopt;
    }
}

std::size_t commasIn(const std::string& text) {
    return static_cast<std::size_t>(std::count(text.begin(), text.end(), ','));
}

}  // namespace

void fuzz::parseNames(std::string_view input) {
    if (input.empty()) {
        return;
    }
    const NameKind kind = input[0] == '0' ? NameKind::Plain : NameKind::Path;
    const std::string text(input.substr(1));

    const std::optional<Names> names = unlessRefused([&] { return expandNames(text, kind); });
    if (!names) {
        return;
    }
    require(names->size() > commasIn(text), "a part of the list is missing");
    require(names->size() <= std::max(maxNamesWithRanges, commasIn(text) + 1), "too many names");

    // Names that come out of a list never need to be refused on their own, and a compressed list
    // that is short enough to be parsed again means the same.
    const std::optional<std::string> shorter =
        unlessRefused([&] { return compressNames(*names, kind); });
    require(shorter.has_value(), "a name of an expanded list was refused");
    const std::optional<Names> again = unlessRefused([&] { return expandNames(*shorter, kind); });
    require(!again || *again == *names, "a list changed its meaning");
}
