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
    nQITRMCAPI100_Property property = 0;
    char* text = NULL;
    double range = 0.0;
    uint8_t high = 0;

    nQITRMCAPI100_initializeSessionWithDevices(&session, "Mod1", 60.0, 3, "", 0.0, &status);
    expect(status.code == 0 && session != 0, "open");

    nQITRMCAPI100_getSystemPropertyStringArray(session, "Sys.Devices", &devices, &count, &status);
    expect(count == 5 && strcmp(devices[0], "Bench") == 0, "list devices");
    nQITRMCAPI100_freeStringArray(devices, count);

    nQITRMCAPI100_openGenericProperty(session, "Mod1", "DMM.Range", &property, &status);
    nQITRMCAPI100_getPropertyPropertyString(property, "Prop.Unit", &text, &status);
    expect(text != NULL && strcmp(text, "V") == 0, "read an attribute");
    nQITRMCAPI100_freeString(text);
    nQITRMCAPI100_closeProperty(property, &status);

    nQITRMCAPI100_setGenericPropertyDouble(session, "Mod1", "DMM.Range", 0.5, &status);
    nQITRMCAPI100_getGenericPropertyDouble(session, "Mod1", "DMM.Range", &range, &status);
    expect(status.code == 0 && range == 0.5, "write and read a property");

    nQITRMCAPI100_writeRegisterUInt16(session, "Mod1", 256, 0x1234, &status);
    nQITRMCAPI100_readRegisterUInt8(session, "Mod1", 257, &high, &status);
    expect(status.code == 0 && high == 0x12, "write and read a register");

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
