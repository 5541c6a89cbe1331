#pragma once
#include <asm-generic/errno.h>  // the kernel's
#ifdef __cplusplus
extern "C" {
#endif
int* __errno(void);
#define ENOTSUP EOPNOTSUPP
#define errno (*__errno())
#ifdef __cplusplus
}
#endif
