#pragma once
#include <sys/types.h>
#include_next <time.h>
#ifdef __cplusplus
extern "C" {
#endif
#define CLOCK_REALTIME 0
#define CLOCK_MONOTONIC 1
struct timespec {
  time_t tv_sec;
  long tv_nsec;
};
struct tm {
  int tm_sec, tm_min, tm_hour, tm_mday, tm_mon, tm_year, tm_wday, tm_yday, tm_isdst;
  long tm_gmtoff;
  const char* tm_zone;
};
int clock_gettime(clockid_t, struct timespec*);
struct tm* gmtime_r(const time_t*, struct tm*);
#ifdef __cplusplus
}
#endif
