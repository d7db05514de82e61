/*
 * Functions that only the simulated driver has: for hosts that check at startup whether the chassis
 * is available, and for tests. The closed driver does not have them; a program that works with both
 * drivers looks them up with dlsym.
 */
#ifndef QITRMCSIM_H
#define QITRMCSIM_H

#include <stdint.h>

#ifdef __cplusplus
extern "C" {
#endif

/* ---- Start and supervision --------------------------------------------------------------------
 */

/*
 * Starts the simulator like the first call of the driver, but without using a session number.
 * Returns 0, or the status code with which all calls of the driver fail. *text is set to a readable
 * summary of the chassis in several lines, to be freed with nQITRMCAPI100_freeString, or to null if
 * the start failed; the reason is then on standard error. Any thread may call this.
 */
int32_t qitrmcsim_start(char** text);

/* The numbers of objects that the driver has allocated or opened and that have not been freed or
 * closed. */
typedef struct {
    uint32_t texts;
    uint32_t numberArrays;
    uint32_t textArrays;
    uint32_t openProperties;
    uint32_t openCommands;
    uint32_t sessions;
} qitrmcsim_Outstanding;

/* Gets the current numbers; all are 0 before the start. Any thread may call this. */
void qitrmcsim_countOutstanding(qitrmcsim_Outstanding* counts);

/* Returns how many calls of the driver have reached the chassis, successful or not; 0 before the
 * start. Calls that only free what the driver has allocated do not count. Any thread may call
 * this. */
uint64_t qitrmcsim_countCalls(void);

/* ---- Faults --------------------------------------------------------------------------------- */

/*
 * Replaces all faults and events by those of a JSON text, whose format the simulator's README
 * describes; "{}" has none. Counts and times start again. When the file that QITRMC_SIM_FAULTS
 * names changes, its faults replace these.
 *
 * Returns 0, or a negative status code, and then changes nothing: -250942 if the text is invalid,
 * -250954 if it is null, -250952 if the simulator cannot start, -250950 if memory runs out.
 * reason: set to null, or to a description of the failure, to be freed with
 * nQITRMCAPI100_freeString. May be null.
 */
int32_t qitrmcsim_setFaults(const char* json, char** reason);

/* ---- Observation ------------------------------------------------------------------------------
 *
 * These set *json to a JSON text, to be freed with nQITRMCAPI100_freeString, and return 0; or they
 * set it to null and return a negative status code: -250952 if the simulator cannot start, -250950
 * if memory runs out. Any thread may call them.
 */

/* The faults in force, as the text that was set or that the file had. */
int32_t qitrmcsim_getFaults(char** json);

/*
 * All devices of the description, those that have been pulled too: an array of objects with
 * "name", "state" ("present", "pulled" or "connection_lost"), "product" where it is known, of a
 * module "slot" and "chassis", and "registers": an array of objects with "address", "size" in
 * bytes, "width" in bits where only one is allowed, and "name" and "description" where the chassis
 * file has them.
 */
int32_t qitrmcsim_describeDevices(char** json);

/*
 * The lines of the trace from a number on, without their ends: {"next": 17, "lines": ["..."]}.
 * Lines are numbered from 0; "next" is the number of the first one that is not there yet, to be
 * passed in the next call. Lines are kept from the first call of this until ten seconds after the
 * last one, the latest 2000; this slows down the driver's functions a little. It does not depend on
 * QITRMC_SIM_TRACE.
 */
int32_t qitrmcsim_readTrace(uint64_t from, char** json);

#ifdef __cplusplus
}
#endif

#endif
