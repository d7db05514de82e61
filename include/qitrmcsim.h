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

#ifdef __cplusplus
}
#endif

#endif
