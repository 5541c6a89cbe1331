/* Loads the library while the program runs, so that the program also starts where there is none. */
#include <dlfcn.h>
#include <senseloom.h> /* for the types: nothing is linked */
#include <stdio.h>

#define FUNCTION(library, name) ((__typeof__(&name))dlsym(library, #name))

int main(void) {
  void* library = dlopen("libsenseloom.so.1", RTLD_NOW | RTLD_LOCAL); /* on a device: "libsenseloom.so" */
  if (library == NULL) {
    fprintf(stderr, "no context sensors: %s\n", dlerror());
    return 1;
  }
  __typeof__(&ctx_open_session) open_session = FUNCTION(library, ctx_open_session);
  __typeof__(&ctx_close_session) close_session = FUNCTION(library, ctx_close_session);
  __typeof__(&ctx_uninit) uninit = FUNCTION(library, ctx_uninit);
  if (open_session == NULL || close_session == NULL || uninit == NULL) return 1;

  void* session = open_session("STAP");
  ctx_option_t* list;
  printf("opened: %s\n", session != NULL ? "yes" : "no");
  printf("closed: %d\n", close_session(session, &list));
  uninit(); /* before the library is unloaded, or what it holds is lost */
  return dlclose(library);
}
