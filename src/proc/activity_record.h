#pragma once

#include <cstdint>
#include <cstring>

namespace senseloom {

// One activity class decision as it stands in records and batches: a class id in the low 4 bits of 16, a sequence
// number in the upper 12.
class ActivityRecord {
 public:
  static constexpr int kSize = sizeof(uint16_t);

  static ActivityRecord at(const void* bytes) {
    ActivityRecord record;
    std::memcpy(&record.bits, bytes, kSize);
    return record;
  }
  void storeAt(void* bytes) const { std::memcpy(bytes, &bits, kSize); }

  uint16_t classId() const { return bits & kClassBits; }
  // Signed: the upper 12 bits, sign-extended.
  int sequence() const { return static_cast<int16_t>(bits) >> 4; }
  ActivityRecord withClass(uint16_t id) const {
    ActivityRecord record;
    record.bits = static_cast<uint16_t>((bits & ~kClassBits) | id);
    return record;
  }

 private:
  static constexpr uint16_t kClassBits = 0xF;
  uint16_t bits = 0;
};

}  // namespace senseloom
