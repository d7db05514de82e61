/*
 * The driver from C, without the service: sets an output of the power supply in the chassis Bench,
 * switches it on, and watches the multimeter that is wired to it.
 *
 * The build of the project makes it: build/release/bin/example_voltage. By hand, after scripts/run
 * has built the driver once:
 *
 *   cc -Iinclude examples/voltage.c -o voltage -Lbuild/release/lib -l:libqitrmcapi.so.1 \
 *      -Wl,-rpath,"$PWD/build/release/lib"
 */
#define _POSIX_C_SOURCE 199309L /* for nanosleep */

#include <math.h>
#include <stdio.h>
#include <stdlib.h>
#include <string.h>
#include <time.h>

#include "qitrmcapi.h"

/*
 * Every status needs a function that enlarges the buffer of its text. The text is kept, the bytes
 * after it are 0, and the last byte of the buffer is the letter J.
 */
static int32_t resizeText(qierr_Status* status, uint32_t size) {
    char* room = NULL;
    if (size != 0) {
        room = calloc(1, size);
        if (room == NULL) {
            return 0;
        }
        if (status->json != NULL) {
            const size_t length = strlen(status->json);
            memcpy(room, status->json, length < size ? length : size - 1);
        }
        room[size - 1] = 'J';
    }
    free(status->json);
    status->json = room;
    status->capacity = size;
    return 1;
}

/*
 * A function does nothing if its status already reports a failure, so a sequence of calls needs
 * only one check at its end.
 */
static void stopOnFailure(const qierr_Status* status) {
    if (status->code < 0) {
        fprintf(stderr, "The driver failed with %d:\n%s\n", (int)status->code,
                status->json == NULL ? "" : status->json);
        exit(1);
    }
}

static void showDevices(nQITRMCAPI100_Session session, qierr_Status* status) {
    char** names = NULL;
    uint32_t count = 0;
    nQITRMCAPI100_getSystemPropertyStringArray(session, "Sys.Devices", &names, &count, status);
    stopOnFailure(status);
    printf("The system has %u devices:", (unsigned)count);
    for (uint32_t i = 0; i < count; ++i) {
        printf(" %s", names[i]);
    }
    printf("\n");
    nQITRMCAPI100_freeStringArray(names, count);
}

static void switchOn(nQITRMCAPI100_Session session, double volts, qierr_Status* status) {
    nQITRMCAPI100_setGenericPropertyDouble(session, "Mod2/ch0", "PSU.Voltage", volts, status);
    nQITRMCAPI100_executeGenericCommand(session, "Mod2/ch0", "PSU.On", 10.0, status);
    stopOnFailure(status);
    printf("Mod2/ch0 is set to %.2f V and switched on.\n", volts);
}

/* Waits for at most two seconds until the multimeter reads the voltage within 10 mV. */
static double settledVoltage(nQITRMCAPI100_Session session, double volts, qierr_Status* status) {
    const struct timespec pause = {0, 10 * 1000 * 1000};
    double measured = 0.0;
    for (int i = 0; i < 200; ++i) {
        nQITRMCAPI100_getGenericPropertyDouble(session, "Mod1/ch0", "DMM.Voltage", &measured,
                                               status);
        stopOnFailure(status);
        if (fabs(measured - volts) < 0.01) {
            break;
        }
        nanosleep(&pause, NULL);
    }
    return measured;
}

/* A status that reports a failure can be used again after its code is set to 0. */
static void showFailure(nQITRMCAPI100_Session session, qierr_Status* status) {
    double voltage = 0.0;
    nQITRMCAPI100_getGenericPropertyDouble(session, "Mod3", "PSU.Voltage", &voltage, status);
    printf("Mod3 is not there, so a question about it fails with %d.\n", (int)status->code);
    status->code = 0;
}

int main(void) {
    qierr_Status status = {0, 0, resizeText, NULL};
    nQITRMCAPI100_Session session = 0;
    nQITRMCAPI100_initializeSessionWithDevices(&session, "Mod1,Mod2", 60.0, 3, "", 0.0, &status);
    stopOnFailure(&status);
    showDevices(session, &status);
    switchOn(session, 3.3, &status);
    printf("Mod1/ch0, which is wired to it, measures %.2f V.\n",
           settledVoltage(session, 3.3, &status));
    showFailure(session, &status);
    nQITRMCAPI100_closeSession(session, &status);
    stopOnFailure(&status);
    resizeText(&status, 0);
    return 0;
}
