#pragma once
#ifdef __cplusplus
extern "C" {
#endif
#define RTLD_LAZY 1
#define RTLD_NEXT ((void*)-1L)
typedef struct {
  const char* dli_fname;
  void* dli_fbase;
  const char* dli_sname;
  void* dli_saddr;
} Dl_info;
void* dlopen(const char*, int);
void* dlsym(void*, const char*);
const char* dlerror(void);
int dladdr(const void*, Dl_info*);
#ifdef __cplusplus
}
#endif
