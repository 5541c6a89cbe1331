/*
 * What only the gesture engine of a Linux host has: it can be told what to answer.
 */
#pragma once

#ifdef __cplusplus
extern "C" {
#endif

/*
 * From here on the engine answers what it is given, started or not, in place of recognising: names[k], NULL for none,
 * to the k-th group of samples, from 0 on, and NULL to all groups behind the last one. `count` is the number of names.
 * It reads them with each group, and copies what it answers. NULL for `names` ends that.
 */
void gesture_answer_with(const char* const* names, int count);

#ifdef __cplusplus
}
#endif
