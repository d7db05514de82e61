#pragma once

#include <array>
#include <functional>
#include <string>
#include <string_view>

namespace simulator {

// Names are compared without regard to letter case, by full Unicode case folding. Two names are
// the same exactly when their folded forms are equal bytes. A text that is not UTF-8 folds to
// itself.
std::string foldName(std::string_view name);

// The folded form of a name, for one look-up. Allocates only for names that are long or not ASCII.
class FoldedName {
  public:
    explicit FoldedName(std::string_view name);
    FoldedName(const FoldedName&) = delete;
    FoldedName& operator=(const FoldedName&) = delete;

    std::string_view text() const { return folded; }

  private:
    std::array<char, 64> shortText;
    std::string otherText;
    std::string_view folded;
};

// Calls visit(name) for each name of a joined text of resources, in order, with the ranges
// expanded: "Mod1/ch0:2,Mod2" stands for "Mod1/ch0", "Mod1/ch1", "Mod1/ch2" and "Mod2". An empty
// text holds no names. Only a name with a slash can be a range. Throws a refusal for a range that
// is backwards or longer than 1024.
void forEachName(std::string_view joined, const std::function<void(const std::string&)>& visit);

// Says why a text cannot be the name of a device, or returns an empty text when it can.
std::string nameError(std::string_view name);
// The same for the part of a channel's or area's name after the slash.
std::string partNameError(std::string_view name);

}  // namespace simulator
