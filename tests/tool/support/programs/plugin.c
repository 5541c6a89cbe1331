/* A plug-in that is linked with the library. */
#include "session.h"

int run_plugin(void);
int run_plugin(void) {
  const struct functions library = {ctx_open_session, ctx_dispatch_data, ctx_close_session};
  return use_sessions(&library);
}
