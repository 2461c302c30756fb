/* Counters of the simulated daemon client library, for tests: they count the
 * calls of this process. */
#ifndef TARNLIB_TARNLIBSIM_H
#define TARNLIB_TARNLIBSIM_H

#include <stdint.h>

#ifdef __cplusplus
extern "C" {
#endif

int64_t TarnLibSim_InitCalls(void);  /* TarnLib_Init calls, successful or not */
int64_t TarnLibSim_ExitCalls(void);  /* TarnLib_Exit calls */
int64_t TarnLibSim_Openings(void);   /* successful TarnLib_Init calls not yet released */
void TarnLibSim_ResetCounters(void);

#ifdef __cplusplus
}
#endif

#endif
