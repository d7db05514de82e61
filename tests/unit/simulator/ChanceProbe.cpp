// Executes a command 256 times, and prints a digit for each time: 1 where it fails. Another command
// is executed in between.

#include <cstdint>
#include <cstdio>

#include "qitrmcapi.h"

namespace {

std::int32_t refuseToGrow(qierr_Status*, std::uint32_t) {
    return 0;
}

std::int32_t execute(nQITRMCAPI100_Session session, const char* device, const char* command) {
    qierr_Status status{0, 0, refuseToGrow, nullptr};
    nQITRMCAPI100_executeGenericCommand(session, device, command, 0.0, &status);
    return status.code;
}

}  // namespace

int main(int count, char** arguments) {
    if (count < 3) {
        return 2;
    }
    qierr_Status status{0, 0, refuseToGrow, nullptr};
    nQITRMCAPI100_Session session = 0;
    nQITRMCAPI100_initializeSessionWithoutResources(&session, &status);
    for (int i = 0; i < 256; ++i) {
        std::putchar(execute(session, arguments[1], arguments[2]) == 0 ? '0' : '1');
        if (count > 3) {
            execute(session, arguments[1], arguments[3]);
        }
    }
    return status.code == 0 ? 0 : 1;
}
