#include "Sessions.h"

#include "Refusal.h"

namespace simulator {

Session& Sessions::make() {
    while (next == 0 || table.count(next) != 0) {
        ++next;
    }
    Session& made = table.try_emplace(next, next).first->second;
    ++next;
    return made;
}

Session& Sessions::get(nQITRMCAPI100_Session handle) {
    const auto found = table.find(handle);
    if (found == table.end() || found->second.opening) {
        throw Refusal(code::unknownSession).usage(tag::sessionHandle, handle);
    }
    return found->second;
}

}  // namespace simulator
