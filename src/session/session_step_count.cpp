#include "session/session_step_count.h"

#include "session/record.h"

namespace senseloom {

int SessionStepCount::parseOption(const char* text) {
  wanted.parse(text);
  return 0;
}

int SessionStepCount::postProcess(void* data, int len, void** out, int* outLen) noexcept {
  if (wanted.mode() == 1) return passThrough(data, len, out, outLen);
  if (wanted.mode() != 0) return 0;

  const auto record = recordBytes(data, len);
  if (record.size() < kValueOffset + sizeof(int32_t)) return 0;
  const int32_t steps = loadI32(record, kValueOffset);
  return steps % (wanted.logN() * 100) == 0 ? passThrough(data, len, out, outLen) : 0;
}

}  // namespace senseloom
