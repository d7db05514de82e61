#pragma once

#include <cstdint>
#include <set>
#include <string>
#include <string_view>
#include <vector>

#include <rapidjson/document.h>

#include "common/ThrowingAllocator.h"

namespace simulator {

using common::ThrowingAllocator;
using JsonAllocator = rapidjson::MemoryPoolAllocator<ThrowingAllocator>;
using JsonValue = rapidjson::GenericValue<rapidjson::UTF8<>, JsonAllocator>;
using JsonDocument =
    rapidjson::GenericDocument<rapidjson::UTF8<>, JsonAllocator, ThrowingAllocator>;

// Thrown when a description is invalid.
struct DescriptionError {
    // Where, as a JSON pointer; empty for the whole text.
    std::string pointer;
    std::string wrong;
    std::string right;
};

// A text with its control characters replaced by question marks.
std::string oneLine(std::string_view text);

// Names with commas between them.
std::string listed(const std::vector<std::string>& names);

// Parses a text, or throws a fault. `what` says what the text is.
void parseDescription(std::string_view text, JsonDocument& document,
                      const char* what = "a chassis description");

// One value of a description together with its place, so that errors can say where they are. The
// reading functions throw DescriptionError.
class Node {
  public:
    explicit Node(const JsonValue& value, std::string pointer = "")
        : value(&value), pointer(std::move(pointer)) {}

    // Makes sure that this is an object with no members but these: a list of Members.h, which has
    // them from the JSON Schemas.
    template <std::size_t count>
    void expectMembers(const std::string_view (&allowed)[count]) const {
        expectMembers(allowed, count);
    }
    bool has(const char* member) const;
    // Calls read(Node) for a member if it is there.
    template <typename Read>
    void ifPresent(const char* name, Read read) const {
        if (has(name)) {
            read(member(name, ""));
        }
    }
    // The member, which must be there. `right` says what it has to be.
    Node member(const char* name, const char* right) const;

    std::string text() const;
    std::uint32_t unsignedNumber(std::uint32_t least, std::uint32_t most) const;
    std::int32_t signedNumber() const;
    double number(double least, double most) const;
    // A time, 0 to a day.
    double seconds() const;
    bool flag() const;

    // The element of an array at an index that it has.
    Node element(std::size_t index) const;
    // Calls visit(Node) for the elements of an array, in order.
    template <typename Visit>
    void forEachElement(Visit visit) const {
        expect(value->IsArray(), "an array");
        for (rapidjson::SizeType i = 0; i < value->Size(); ++i) {
            visit(element(i));
        }
    }
    // Calls visit(name, Node) for the members of an object, in order. None may occur twice.
    template <typename Visit>
    void forEachMember(Visit visit) const {
        expect(value->IsObject(), "an object");
        std::set<std::string> seen;
        for (const auto& entry : value->GetObject()) {
            const std::string name(entry.name.GetString(), entry.name.GetStringLength());
            const Node member(entry.value, childPointer(name));
            if (!seen.insert(name).second) {
                member.fail("stands there twice", "each member may be given once");
            }
            visit(name, member);
        }
    }

    const JsonValue& json() const { return *value; }

    [[noreturn]] void fail(std::string wrong, std::string right) const;
    // What the value is, for messages.
    std::string shown() const;
    // Fails with what the value is and what it must be unless the condition holds.
    void expect(bool condition, const char* right) const;

  private:
    void expectMembers(const std::string_view* allowed, std::size_t count) const;
    std::string childPointer(std::string_view name) const;

    const JsonValue* value;
    std::string pointer;
};

}  // namespace simulator
