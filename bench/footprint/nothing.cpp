// Stands in for the library where loading it is compared with loading what it depends on.
#include "senseloom.h"

void* ctx_open_session(const char* /*sensor*/) noexcept {
  return nullptr;
}
