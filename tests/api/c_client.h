#pragma once

#ifdef __cplusplus
extern "C" {
#endif

/* Runs a client written in C; returns 0, or the line of its first expectation that did not hold. */
int runClientInC(void);

#ifdef __cplusplus
}
#endif
