#pragma once
#ifdef __cplusplus
extern "C" {
#endif
#define LOCK_EX 2
#define LOCK_NB 4
int flock(int, int);
#ifdef __cplusplus
}
#endif
