#pragma once
#include <stddef.h>
#ifdef __cplusplus
extern "C" {
#endif
typedef struct __sFILE FILE;
int puts(const char*);
// For the C++ library.
#define EOF (-1)
int remove(const char*);
#ifdef __cplusplus
}
#endif
