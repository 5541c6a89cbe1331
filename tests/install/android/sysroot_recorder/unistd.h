#pragma once
#include <sys/types.h>
#ifdef __cplusplus
extern "C" {
#endif
#define F_OK 0
int access(const char*, int);
int close(int);
int ftruncate(int, off_t);  // since API level 12 with 64 bits
pid_t getpid(void);
ssize_t pwrite(int, const void*, size_t, off_t);
ssize_t readlink(const char*, char*, size_t);
long syscall(long, ...);
int unlink(const char*);
ssize_t write(int, const void*, size_t);
#ifdef __cplusplus
}
#endif
