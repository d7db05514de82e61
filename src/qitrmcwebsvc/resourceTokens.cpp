#include "qitrmcwebsvc/resourceTokens.h"

#include <algorithm>
#include <iterator>

namespace nQITRMCWEBSVC100 {
namespace {

struct Token {
    const char* name;
    const char* property;
    // The kind of resources whose default it stands for.
    ResourceKind defaultOf;
};

constexpr Token tokens[] = {
    {"$ConnectedDevices", "Session.ConnectedDevices", ResourceKind::None},
    {"$DefaultDevices", "Session.DefaultDevices", ResourceKind::Device},
    {"$DefaultNVMEMAreas", "Session.DefaultNVMEMAreas", ResourceKind::NvmemArea},
    {"$DefaultPhysChans", "Session.DefaultPhysChans", ResourceKind::PhysicalChannel},
    {"$ReservedDevices", "Session.ReservedDevices", ResourceKind::None},
};

template <class Condition>
const Token* findToken(Condition condition) {
    const Token* found = std::find_if(std::begin(tokens), std::end(tokens), condition);
    return found == std::end(tokens) ? nullptr : found;
}

}  // namespace

const char* propertyOfToken(std::string_view name) {
    const Token* token = findToken([&](const Token& row) { return row.name == name; });
    return token == nullptr ? nullptr : token->property;
}

const char* defaultTokenOf(ResourceKind kind) {
    const Token* token = findToken(
        [&](const Token& row) { return kind != ResourceKind::None && row.defaultOf == kind; });
    return token == nullptr ? nullptr : token->name;
}

}  // namespace nQITRMCWEBSVC100
