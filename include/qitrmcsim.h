/*
 * What the simulated driver offers beyond the driver's own functions: for hosts that want to know
 * early whether the chassis is there, and for tests. The closed driver has none of this; a program
 * that runs with both looks these functions up with dlsym.
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
 * Starts the simulator, as the first call of the driver would, and takes no session's number.
 * Returns 0, or the status code that all calls of the driver fail with. *text is then a summary of
 * the chassis in lines for people to read, or null when the start failed: the reason stands on
 * standard error. The text goes back through nQITRMCAPI100_freeString. Any thread may call this.
 */
int32_t qitrmcsim_start(char** text);

/* How many things the driver has lent, or opened, that have not come back. */
typedef struct {
    uint32_t texts;
    uint32_t numberArrays;
    uint32_t textArrays;
    uint32_t openProperties;
    uint32_t openCommands;
    uint32_t sessions;
} qitrmcsim_Outstanding;

/* Counts what is outstanding at this moment; all 0 before the start. Any thread may call this. */
void qitrmcsim_countOutstanding(qitrmcsim_Outstanding* counts);

/* ---- Faults --------------------------------------------------------------------------------- */

/*
 * Replaces all faults and events by those of a JSON text, whose form the simulator's README tells;
 * "{}" has none. Counts and times begin anew. A file that QITRMC_SIM_FAULTS names takes over again
 * when it changes.
 *
 * Returns 0, or the negative code of a status; then everything is as it was: -250942 when the text
 * is not as it should be, -250954 when it is null, -250952 when the simulator itself cannot start,
 * -250950 without memory.
 * reason: set to null, or to words about a failure, to be given back through
 * nQITRMCAPI100_freeString. May be null when nobody wants to know.
 */
int32_t qitrmcsim_setFaults(const char* json, char** reason);

#ifdef __cplusplus
}
#endif

#endif
