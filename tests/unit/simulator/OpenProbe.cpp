// Opens three sessions, and prints for each a line with the code and the text of the status, and
// the handle.

#include <cstdint>
#include <cstdio>
#include <cstdlib>

#include "qitrmcapi.h"

namespace {

std::int32_t grow(qierr_Status* status, std::uint32_t size) {
    char* bigger = static_cast<char*>(std::realloc(status->json, size));
    if (bigger == nullptr) {
        return 0;
    }
    status->json = bigger;
    status->capacity = size;
    return 1;
}

}  // namespace

int main() {
    qierr_Status status{0, 0, grow, nullptr};
    nQITRMCAPI100_Session sessions[3] = {};
    for (nQITRMCAPI100_Session& session : sessions) {
        nQITRMCAPI100_initializeSessionWithoutResources(&session, &status);
    }
    std::printf("%d\n%s\n", static_cast<int>(status.code),
                status.json != nullptr ? status.json : "");
    std::printf("%u %u %u\n", static_cast<unsigned>(sessions[0]),
                static_cast<unsigned>(sessions[1]), static_cast<unsigned>(sessions[2]));
    std::free(status.json);
    return 0;
}
