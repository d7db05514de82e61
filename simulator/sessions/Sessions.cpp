#include "sessions/Sessions.h"

#include "status/Refusal.h"

namespace simulator {

Session& Sessions::make() {
    Session fresh;
    fresh.properties = firstProperties;
    lasting.reserveSessionNumber(table.upcoming());
    const nQITRMCAPI100_Session handle = table.add(std::move(fresh));
    Session& made = *table.find(handle);
    made.handle = handle;
    return made;
}

Session& Sessions::get(nQITRMCAPI100_Session handle) {
    Session* found = table.find(handle);
    if (found == nullptr || found->opening) {
        throw Refusal(code::unknownSession).usage(tag::sessionHandle, handle);
    }
    return *found;
}

}  // namespace simulator
