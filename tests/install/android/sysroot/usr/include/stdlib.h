#pragma once
#include <stddef.h>
#ifdef __cplusplus
extern "C" {
#endif
void* calloc(size_t, size_t);
void free(void*);
// The following are for the C++ library.
typedef struct {
  long quot, rem;
} ldiv_t;
typedef struct {
  long long quot, rem;
} lldiv_t;
ldiv_t ldiv(long, long);
lldiv_t lldiv(long long, long long);
int posix_memalign(void**, size_t, size_t);
#ifdef __cplusplus
}
#endif
