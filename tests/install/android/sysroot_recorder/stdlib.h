#pragma once
#include_next <stdlib.h>
#ifdef __cplusplus
extern "C" {
#endif
char* getenv(const char*);
#ifdef __cplusplus
}
#endif
