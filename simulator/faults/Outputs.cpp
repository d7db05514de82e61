#include "faults/Outputs.h"

#include <algorithm>
#include <new>
#include <utility>

#include "lending/Lending.h"

namespace simulator {

namespace {

constexpr std::size_t mostTextBytes = std::size_t{1} << 30;

template <typename Number>
void takeBack(Number* array) noexcept {
    takeBackNumbers(array);
}

void takeBack(char** array) noexcept {
    takeBackTexts(array);
}

template <typename Item>
void lendInstead(const OutputArray<Item>& wanted, Item* array, std::uint32_t count) noexcept {
    takeBack(std::exchange(*wanted.place, array));
    *wanted.count = count;
}

// The items of an array, repeated until there are `count` of them.
template <typename Number>
Number* repeated(const Number* items, std::uint32_t present, std::uint32_t count) {
    std::vector<Number> list(count);
    for (std::uint32_t i = 0; i < count && present > 0; ++i) {
        list[i] = items[i % present];
    }
    return lendNumbers(list);
}

// A function object for each kind of output.
class Distortion {
  public:
    explicit Distortion(const OutputFault& output) : output(output) {}

    void operator()(const Output<char*>& wanted) const {
        if (output.isNull) {
            takeBackText(std::exchange(*wanted.place, nullptr));
        } else if (output.textSize) {
            takeBackText(std::exchange(*wanted.place, lendText(longText())));
        }
    }
    template <typename Number>
    void operator()(const OutputArray<Number>& wanted) const {
        if (output.isNull) {
            lendInstead(wanted, static_cast<Number*>(nullptr), output.count.value_or(0));
        } else if (output.count) {
            lendInstead(wanted, repeated(*wanted.place, *wanted.count, *output.count),
                        *output.count);
        }
    }
    void operator()(const OutputArray<char*>& wanted) const {
        if (output.isNull) {
            lendInstead(wanted, static_cast<char**>(nullptr), output.count.value_or(0));
        } else {
            const std::uint32_t count = output.count.value_or(*wanted.count);
            lendInstead(wanted, textsInsteadOf(*wanted.place, *wanted.count, count), count);
        }
    }
    // Numbers, and what the caller gives.
    template <typename Other>
    void operator()(const Other&) const {}

  private:
    std::string longText() const { return std::string(*output.textSize, 'x'); }

    char** textsInsteadOf(char* const* texts, std::uint32_t present, std::uint32_t count) const {
        const std::string sized(output.textSize.value_or(0), 'x');
        const auto textAt = [&](std::size_t index) -> std::string_view {
            if (output.hasNullItems) {
                return {};
            }
            if (output.textSize) {
                return sized;
            }
            return present > 0 ? texts[index % present] : "";
        };
        std::size_t bytes = 0;
        for (std::size_t i = 0; i < count; ++i) {
            bytes += textAt(i).size();
            if (bytes > mostTextBytes) {
                throw std::bad_alloc();
            }
        }
        return lendTexts(count, textAt);
    }

    const OutputFault& output;
};

// Takes back an output of any kind.
struct TakingBack {
    void operator()(const Output<char*>& wanted) const {
        takeBackText(std::exchange(*wanted.place, nullptr));
    }
    template <typename Number>
    void operator()(const Output<Number>& wanted) const {
        *wanted.place = Number{};
    }
    template <typename Item>
    void operator()(const OutputArray<Item>& wanted) const {
        lendInstead(wanted, static_cast<Item*>(nullptr), 0);
    }
    void operator()(const OutputBytes& wanted) const {
        std::fill_n(wanted.buffer, wanted.size, std::uint8_t{0});
    }
    template <typename Other>
    void operator()(const Other&) const {}
};

bool beginsWith(std::string_view name, std::string_view beginning) {
    return name.substr(0, beginning.size()) == beginning;
}

// Closes what a function that opens something has given its caller a handle of.
void closeOpened(Simulator& simulator, std::string_view function, std::uint32_t handle) noexcept {
    if (beginsWith(function, "initializeSession")) {
        simulator.close(handle);
    } else if (function == "openGenericCommand") {
        simulator.openCommands.remove(handle);
    } else if (beginsWith(function, "open")) {
        simulator.openProperties.remove(handle);
    }
}

}  // namespace

void distortOutputs(const Call& call, const OutputFault& output) {
    for (const Argument& argument : call) {
        std::visit(Distortion(output), argument.value);
    }
}

void takeBackOutputs(Simulator& simulator, const Call& call) noexcept {
    for (const Argument& argument : call) {
        if (const auto* number = std::get_if<Output<std::uint32_t>>(&argument.value)) {
            closeOpened(simulator, call.function(), *number->place);
        }
        std::visit(TakingBack(), argument.value);
    }
}

}  // namespace simulator
