#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <string_view>
#include <variant>

#include "Api.h"

namespace simulator {

// An array that a caller gives.
template <typename Item>
struct InputArray {
    const Item* items;
    std::uint32_t count;
};

// Where the function puts one value, an array, or bytes in a buffer of the caller.
template <typename Item>
struct Output {
    Item* place;
};
template <typename Item>
struct OutputArray {
    Item** place;
    std::uint32_t* count;
};
struct OutputBytes {
    std::uint8_t* buffer;
    std::uint32_t size;
};

// One argument of a call, as passed to the C function.
struct Argument {
    using Value = std::variant<
        std::uint8_t, std::uint16_t, std::uint32_t, std::uint64_t, std::int32_t, std::int64_t,
        double, const char*, InputArray<std::uint8_t>, InputArray<std::uint32_t>,
        InputArray<std::uint64_t>, InputArray<std::int32_t>, InputArray<std::int64_t>,
        InputArray<double>, InputArray<const char*>, Output<std::uint8_t>, Output<std::uint16_t>,
        Output<std::uint32_t>, Output<std::uint64_t>, Output<std::int32_t>, Output<std::int64_t>,
        Output<double>, Output<char*>, OutputArray<std::uint8_t>, OutputArray<std::uint32_t>,
        OutputArray<std::uint64_t>, OutputArray<std::int32_t>, OutputArray<std::int64_t>,
        OutputArray<double>, OutputArray<char*>, OutputBytes>;

    // Whether the function puts something there.
    bool isOutput() const { return value.index() >= firstOutput; }

    const char* name;
    Value value;

  private:
    static constexpr std::size_t firstOutput = 15;
};

// One call of the driver, for traces and faults. It refers to the arguments of the caller, so it is
// valid during the call only. Creating one allocates nothing.
class Call {
  public:
    // function: the name of the C function, a text that exists as long as the library.
    explicit Call(const char* function);

    // Append an argument; at most `most`.
    Call& session(nQITRMCAPI100_Session handle);
    // The argument that names the resources that the call is about. When it is null, `otherwise`
    // names them.
    Call& resources(const char* name, const char* joined, const char* otherwise = nullptr);
    template <typename Item>
    Call& in(const char* name, Item item) {
        return add(name, item);
    }
    template <typename Item>
    Call& in(const char* name, const Item* items, std::uint32_t count) {
        return add(name, InputArray<Item>{items, count});
    }
    template <typename Item>
    Call& out(const char* name, Item* place) {
        return add(name, Output<Item>{place});
    }
    template <typename Item>
    Call& out(const char* name, Item** place, std::uint32_t* count) {
        return add(name, OutputArray<Item>{place, count});
    }
    Call& out(const char* name, std::uint8_t* buffer, std::uint32_t size) {
        return add(name, OutputBytes{buffer, size});
    }

    // Without the prefix that all functions have.
    std::string_view function() const { return functionName; }
    // 0 when the call belongs to no session.
    nQITRMCAPI100_Session sessionHandle() const { return handle; }
    // Null when the call names no resources.
    const char* resourceNames() const { return resourceText; }

    const Argument* begin() const { return arguments.data(); }
    const Argument* end() const { return arguments.data() + count; }

  private:
    static constexpr std::size_t most = 6;

    Call& add(const char* name, Argument::Value value);

    std::string_view functionName;
    nQITRMCAPI100_Session handle = 0;
    const char* resourceText = nullptr;
    std::array<Argument, most> arguments{};
    std::size_t count = 0;
};

}  // namespace simulator
