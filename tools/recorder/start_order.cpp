#include "start_order.h"

#include <cstdlib>
#ifdef __ANDROID__
#include <sys/system_properties.h>
#endif

namespace senseloom::trace {

std::string startOrder() {
  if (const char* given = std::getenv("SENSELOOM_TRACE")) return given;
#ifdef __ANDROID__
  char value[PROP_VALUE_MAX];
  const int length = __system_property_get("debug.senseloom.trace", value);
  if (length > 0) return {value, static_cast<size_t>(length)};
#endif
  return "";
}

}  // namespace senseloom::trace
