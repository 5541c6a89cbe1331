/*
 * The gesture engine: recognises hand-drawn gestures in motion samples. One engine serves the process; it is used from
 * one thread at a time.
 */
#pragma once

#include <stdbool.h>
#include <stdint.h>

#ifdef __cplusplus
extern "C" {
#endif

/* Starts the engine, or starts it over. The arguments are not looked at. Returns whether it started. */
bool gesture_initial(int, int);

/*
 * Takes one group of six samples, the next of a record; `count` is the number of groups, 1. `last` ends the record.
 *
 * Returns the name of the gesture that was recognised, NUL-terminated and from array new: the caller owns it and
 * releases it with array delete. NULL when none was, and always while the engine is not started.
 */
char* gesture_process_single_data(const int16_t* group, int count, bool last);

/* Stops the engine. Harmless when it is not started. */
void gesture_close(void);

#ifdef __cplusplus
}
#endif
