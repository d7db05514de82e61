#include "trace/Call.h"

namespace simulator {

namespace {

constexpr std::string_view prefix = "nQITRMCAPI100_";

}  // namespace

Call::Call(const char* function) : functionName(function) {
    functionName.remove_prefix(prefix.size());
}

Call& Call::session(nQITRMCAPI100_Session session) {
    handle = session;
    return add("session", session);
}

Call& Call::resources(const char* name, const char* joined, const char* otherwise) {
    resourceText = joined != nullptr ? joined : otherwise;
    return add(name, joined);
}

Call& Call::add(const char* name, Argument::Value value) {
    arguments[count] = {name, value};
    ++count;
    return *this;
}

}  // namespace simulator
