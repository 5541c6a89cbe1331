#pragma once
#include <sys/types.h>
#ifdef __cplusplus
extern "C" {
#endif
typedef long pthread_t;
typedef int pthread_key_t;
typedef struct {
  int value;
} pthread_mutex_t;
#define PTHREAD_MUTEX_INITIALIZER \
  { 0 }
int pthread_mutex_lock(pthread_mutex_t*);
int pthread_mutex_unlock(pthread_mutex_t*);
int pthread_key_create(pthread_key_t*, void (*)(void*));
void* pthread_getspecific(pthread_key_t);
int pthread_setspecific(pthread_key_t, const void*);
int pthread_atfork(void (*)(void), void (*)(void), void (*)(void));
#ifdef __cplusplus
}
#endif
