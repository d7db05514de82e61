/* Walks through a session in C99. Exits with 0 when every step did what it should. */

#include <stdio.h>
#include <stdlib.h>
#include <string.h>

#include "qitrmcapi.h"

static int32_t growJson(qierr_Status* status, uint32_t size) {
    char* bigger = realloc(status->json, size);
    if (bigger == NULL) {
        return 0;
    }
    status->json = bigger;
    status->capacity = size;
    return 1;
}

static int failures = 0;

static void expect(int holds, const char* what) {
    if (!holds) {
        fprintf(stderr, "failed: %s\n", what);
        ++failures;
    }
}

int main(void) {
    qierr_Status status = {0, 0, growJson, NULL};
    nQITRMCAPI100_Session session = 0;
    char** devices = NULL;
    uint32_t count = 0;

    nQITRMCAPI100_initializeSessionWithDevices(&session, "Mod1", 60.0, 3, "", 0.0, &status);
    expect(status.code == 0 && session != 0, "open");

    nQITRMCAPI100_getSystemPropertyStringArray(session, "Sys.Devices", &devices, &count, &status);
    expect(count == 5 && strcmp(devices[0], "Bench") == 0, "list devices");
    nQITRMCAPI100_freeStringArray(devices, count);

    nQITRMCAPI100_unreserveDevices(session, "Mod1", &status);
    expect(status.code == 0, "unreserve");

    nQITRMCAPI100_reserveDevices(session, "Mod3", 3, "", 0.0, &status);
    expect(status.code == -250956 && strstr(status.json, "\"Mod3\"") != NULL, "unknown device");
    status.code = 0;

    nQITRMCAPI100_closeSession(session, &status);
    expect(status.code == 0, "close");

    free(status.json);
    return failures == 0 ? 0 : 1;
}
