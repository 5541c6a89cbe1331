#pragma once
#include <sys/types.h>
#ifdef __cplusplus
extern "C" {
#endif
#define PROT_READ 1
#define PROT_WRITE 2
#define MAP_SHARED 1
#define MAP_FAILED ((void*)-1)
void* mmap(void*, size_t, int, int, int, off_t);  // since API level 21 with 64 bits
int munmap(void*, size_t);
#ifdef __cplusplus
}
#endif
