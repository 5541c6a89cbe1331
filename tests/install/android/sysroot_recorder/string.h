#pragma once
#include_next <string.h>
#ifdef __cplusplus
extern "C" {
#endif
size_t strnlen(const char*, size_t);
#ifdef __cplusplus
}
#endif
