#pragma once
#ifdef __cplusplus
extern "C" {
#endif
#define RLIMIT_FSIZE 1
#define RLIM_INFINITY (~0UL)
typedef unsigned long rlim_t;
struct rlimit {
  rlim_t rlim_cur, rlim_max;
};
int getrlimit(int, struct rlimit*);
#ifdef __cplusplus
}
#endif
