#include "lending/SharedTexts.h"

#include <cstdlib>

#include "lending/Ledger.h"
#include "lending/Lending.h"

namespace simulator {

SharedTexts::SharedTexts(const std::vector<std::string_view>& texts)
    : array(lendTexts(texts.size(), [&](std::size_t index) { return texts[index]; })),
      size(static_cast<std::uint32_t>(texts.size())) {
    if (array != nullptr) {
        Ledger::instance().keep(array);
        takeBackTexts(array);
    }
}

SharedTexts::~SharedTexts() {
    if (array != nullptr && Ledger::instance().release(array)) {
        std::free(array);
    }
}

char** SharedTexts::lend() const noexcept {
    if (array != nullptr) {
        Ledger::instance().lend(array, Ledger::Item::Texts);
    }
    return array;
}

}  // namespace simulator
