#pragma once
#ifdef __cplusplus
extern "C" {
#endif
#define SYS_gettid 224
#define SYS_memfd_create 356
#ifdef __cplusplus
}
#endif
