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
struct Given {
    const Item* items;
    uint32_t count;
};

// Where a caller wants one value, an array, or bytes in a buffer of its own.
template <typename Item>
struct Wanted {
    Item* place;
};
template <typename Item>
struct WantedArray {
    Item** place;
    uint32_t* count;
};
struct WantedBytes {
    uint8_t* buffer;
    uint32_t size;
};

// One argument of a call, as the C function got it.
struct Argument {
    using Value =
        std::variant<uint8_t, uint16_t, uint32_t, uint64_t, int32_t, int64_t, double, const char*,
                     Given<uint8_t>, Given<uint32_t>, Given<uint64_t>, Given<int32_t>,
                     Given<int64_t>, Given<double>, Given<const char*>, Wanted<uint8_t>,
                     Wanted<uint16_t>, Wanted<uint32_t>, Wanted<uint64_t>, Wanted<int32_t>,
                     Wanted<int64_t>, Wanted<double>, Wanted<char*>, WantedArray<uint8_t>,
                     WantedArray<uint32_t>, WantedArray<uint64_t>, WantedArray<int32_t>,
                     WantedArray<int64_t>, WantedArray<double>, WantedArray<char*>, WantedBytes>;

    // Whether the function puts something there.
    bool isOutput() const { return value.index() >= firstOutput; }

    const char* name;
    Value value;

  private:
    static constexpr size_t firstOutput = 15;
};

// One call of the driver, for those who watch calls. It points to what the caller gave, so it lives
// as long as the call. Making one allocates nothing.
class Call {
  public:
    // function: the name of the C function, a text that lives as long as the library.
    explicit Call(const char* function);

    // Add an argument behind those present; at most `most`.
    Call& session(nQITRMCAPI100_Session handle);
    // The argument that names the resources that the call is about. When it is null, `otherwise`
    // names them.
    Call& resources(const char* name, const char* joined, const char* otherwise = nullptr);
    template <typename Item>
    Call& in(const char* name, Item item) {
        return add(name, item);
    }
    template <typename Item>
    Call& in(const char* name, const Item* items, uint32_t count) {
        return add(name, Given<Item>{items, count});
    }
    template <typename Item>
    Call& out(const char* name, Item* place) {
        return add(name, Wanted<Item>{place});
    }
    template <typename Item>
    Call& out(const char* name, Item** place, uint32_t* count) {
        return add(name, WantedArray<Item>{place, count});
    }
    Call& out(const char* name, uint8_t* buffer, uint32_t size) {
        return add(name, WantedBytes{buffer, size});
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
    static constexpr size_t most = 6;

    Call& add(const char* name, Argument::Value value);

    std::string_view functionName;
    nQITRMCAPI100_Session handle = 0;
    const char* resourceText = nullptr;
    std::array<Argument, most> arguments{};
    size_t count = 0;
};

}  // namespace simulator
