#include "registry/negotiation.h"

#include <android/log.h>

namespace senseloom {

void negotiate(ContextSensor& sensor, std::unique_ptr<Option> merged, ctx_option_t** out) {
  const auto count = static_cast<int>(sensor.sessions.size());
  int index = 0;
  for (const Session* session : sensor.sessions) {
    __android_log_print(ANDROID_LOG_INFO, "Libsl", "The %d of %d session of sensor %s has %p option!\n", index++, count,
                        session->name, static_cast<const void*>(session));
    merged->merge(*session->option);
  }
  sensor.mergedOption = std::move(merged);
  sensor.mergedOption->setProperty(out);
}

bool rebuildSessions(const ContextSensor& sensor) {
  bool allRebuilt = true;
  for (Session* session : sensor.sessions) {
    if (session->buildProc() < 0) allRebuilt = false;
  }
  return allRebuilt;
}

}  // namespace senseloom
