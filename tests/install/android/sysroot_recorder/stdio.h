#pragma once
#include_next <stdio.h>
#ifdef __cplusplus
extern "C" {
#endif
int snprintf(char*, size_t, const char*, ...);
#ifdef __cplusplus
}
#endif
