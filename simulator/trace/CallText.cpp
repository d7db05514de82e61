#include "trace/CallText.h"

#include <algorithm>
#include <type_traits>

#include "model/Values.h"
#include "status/Details.h"

namespace simulator {

namespace {

constexpr std::size_t longestText = 200;
constexpr std::uint32_t mostItems = 16;

std::string itemText(const char* text) {
    if (text == nullptr) {
        return "null";
    }
    const std::string_view whole(text);
    std::string shown = quoted(whole.substr(0, longestText));
    if (whole.size() > longestText) {
        shown += "...(" + std::to_string(whole.size()) + " bytes)";
    }
    return shown;
}

std::string itemText(double number) {
    return numberText(number);
}

template <typename Integer, typename = std::enable_if_t<std::is_integral_v<Integer>>>
std::string itemText(Integer number) {
    return std::to_string(number);
}

template <typename Item>
std::string listText(const Item* items, std::uint32_t count) {
    if (items == nullptr) {
        return "null";
    }
    std::string text = "[";
    for (std::uint32_t i = 0; i < std::min(count, mostItems); ++i) {
        text += (i == 0 ? "" : ",") + itemText(items[i]);
    }
    return text + (count > mostItems ? ",...(" + std::to_string(count) + ")]" : "]");
}

// One function for each kind of argument. Places are read after the call.
struct ValueText {
    template <typename Item>
    std::string operator()(const InputArray<Item>& given) const {
        return listText(given.items, given.count);
    }
    template <typename Item>
    std::string operator()(const Output<Item>& wanted) const {
        return itemText(*wanted.place);
    }
    template <typename Item>
    std::string operator()(const OutputArray<Item>& wanted) const {
        return listText(*wanted.place, *wanted.count);
    }
    std::string operator()(const OutputBytes& wanted) const {
        return listText(wanted.buffer, wanted.size);
    }
    template <typename Item>
    std::string operator()(Item item) const {
        return itemText(item);
    }
};

std::string joined(const Call& call, bool outputs, const char* separator) {
    std::string text;
    for (const Argument& argument : call) {
        if (argument.isOutput() == outputs) {
            text += (text.empty() ? "" : separator) + std::string(argument.name) + "=" +
                    std::visit(ValueText(), argument.value);
        }
    }
    return text;
}

}  // namespace

std::string callText(const Call& call, const qierr_Status& status) {
    std::string text(call.function());
    text += "(" + joined(call, false, ", ") + ") -> " + std::to_string(status.code);
    if (status.code != 0 && status.json != nullptr) {
        text += std::string(" ") + status.json;
    }
    const std::string outputs = status.code < 0 ? "" : joined(call, true, " ");
    return text + (outputs.empty() ? "" : " " + outputs);
}

}  // namespace simulator
