/*
 * Loads the library itself, or a plug-in that is linked with it: loader FILE [deep|global]. Returns 0 when everything
 * worked, and the library's variables are those that the library writes to.
 */
#define _GNU_SOURCE
#include <dlfcn.h>
#include <stdbool.h>
#include <stdio.h>
#include <string.h>

#include "session.h"

/* The variables of the library are seen by name, too. */
static int use_audio(void* handle) {
  bool (*activate)(void);
  bool (*deactivate)(void);
  *(void**)&activate = dlsym(handle, "audio_hal_activate");
  *(void**)&deactivate = dlsym(handle, "audio_hal_deactivate");
  const bool* is_activated = dlsym(handle, "gIsActivated");
  void* const* opened = dlsym(handle, "device");
  if (!activate() || !*is_activated || *opened == NULL) return 11;
  if (!deactivate() || *is_activated || *opened != NULL) return 12;
  return 0;
}

int main(int argc, char** argv) {
  int mode = RTLD_NOW | RTLD_LOCAL;
  if (argc > 2) mode = strcmp(argv[2], "deep") == 0 ? RTLD_NOW | RTLD_DEEPBIND : RTLD_NOW | RTLD_GLOBAL;
  void* handle = dlopen(argv[1], mode);
  if (handle == NULL) {
    fprintf(stderr, "%s\n", dlerror());
    return 10;
  }
  int (*run_plugin)(void);
  *(void**)&run_plugin = dlsym(handle, "run_plugin");
  if (run_plugin != NULL) return run_plugin();

  struct functions library;
  *(void**)&library.open_session = dlsym(handle, "ctx_open_session");
  *(void**)&library.dispatch_data = dlsym(handle, "ctx_dispatch_data");
  *(void**)&library.close_session = dlsym(handle, "ctx_close_session");
  const int failure = use_sessions(&library);
  return failure != 0 ? failure : use_audio(handle);
}
