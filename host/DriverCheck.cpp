#include "host/DriverCheck.h"

#include <dlfcn.h>
#include <qitrmcapi.h>
#include <sys/wait.h>
#include <unistd.h>

#include "host/Failure.h"

namespace host {

namespace {

using OpenSession = decltype(&nQITRMCAPI100_initializeSessionWithoutResources);

// The check needs the code alone.
int32_t keepNoDetails(qierr_Status*, uint32_t) {
    return 0;
}

bool opens(OpenSession open) {
    qierr_Status status = {0, 0, keepNoDetails, nullptr};
    nQITRMCAPI100_Session session = 0;
    open(&session, &status);
    return status.code >= 0;
}

// In a process of its own, so that the sessions of clients are numbered as without the check.
bool opensElsewhere(OpenSession open) {
    const pid_t child = fork();
    if (child == 0)
        _exit(opens(open) ? 0 : 1);
    int result = 0;
    return child > 0 && waitpid(child, &result, 0) == child && result == 0;
}

}  // namespace

void checkDriver() {
    void* const driver = dlopen("libqitrmcapi.so.1", RTLD_NOW | RTLD_NOLOAD);
    if (driver == nullptr)
        return;
    void* const open = dlsym(driver, "nQITRMCAPI100_initializeSessionWithoutResources");
    const bool works = open != nullptr && opensElsewhere(reinterpret_cast<OpenSession>(open));
    dlclose(driver);
    if (!works) {
        throw Failure(
            "The driver opens no session. Mend the chassis file, or name another with --chassis.");
    }
}

}  // namespace host
