#pragma once
#include <sys/types.h>
#ifdef __cplusplus
extern "C" {
#endif
#define O_WRONLY 01
#define O_RDWR 02
#define O_CREAT 0100
#define O_EXCL 0200
#define O_NOCTTY 0400
#define O_NONBLOCK 04000
#define O_CLOEXEC 02000000
int open(const char*, int, ...);
int fcntl(int, int, ...);
int fallocate(int, int, off_t, off_t);  // since API level 21
#ifdef __cplusplus
}
#endif
