#pragma once
#include <stddef.h>
#ifdef __cplusplus
extern "C" {
#endif
void* memcpy(void*, const void*, size_t);
void* memmove(void*, const void*, size_t);
int strcmp(const char*, const char*);
char* strerror(int);
size_t strlen(const char*);
char* strncpy(char*, const char*, size_t);
// The following are for the C++ library.
int memcmp(const void*, const void*, size_t);
void* memset(void*, int, size_t);
void* memchr(const void*, int, size_t);
char* strchr(const char*, int);
char* strpbrk(const char*, const char*);
char* strrchr(const char*, int);
char* strstr(const char*, const char*);
#ifdef __cplusplus
}
#endif
