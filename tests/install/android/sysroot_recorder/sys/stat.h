#pragma once
#include <sys/types.h>
#include <time.h>
#ifdef __cplusplus
extern "C" {
#endif
#define S_IRUSR 0400
#define S_IWUSR 0200
#define S_ISREG(mode) (((mode)&0170000) == 0100000)
#define S_ISDIR(mode) (((mode)&0170000) == 0040000)
#define S_ISCHR(mode) (((mode)&0170000) == 0020000)
#define S_ISFIFO(mode) (((mode)&0170000) == 0010000)
struct stat {
  unsigned long long st_dev;
  unsigned int st_mode;
  long long st_size;
  struct timespec st_mtim;
  unsigned long long st_ino;
};
int stat(const char*, struct stat*);
int fstat(int, struct stat*);
#ifdef __cplusplus
}
#endif
