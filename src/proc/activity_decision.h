#pragma once

#include <cstdint>
#include <cstring>

namespace senseloom {

// One decision of the activity classifier as it stands in records and batches: a class id in the low 4 bits of 16, a
// sequence number in the upper 12.
class ActivityDecision {
 public:
  static constexpr size_t kSize = sizeof(uint16_t);
  static constexpr size_t kClassIds = 16;

  static ActivityDecision at(const void* bytes) {
    ActivityDecision decision;
    std::memcpy(&decision.bits, bytes, kSize);
    return decision;
  }
  void storeAt(void* bytes) const { std::memcpy(bytes, &bits, kSize); }

  uint16_t classId() const { return bits & kClassBits; }
  ActivityDecision withClass(uint16_t id) const {
    ActivityDecision decision;
    decision.bits = static_cast<uint16_t>((bits & ~kClassBits) | id);
    return decision;
  }

 private:
  static constexpr uint16_t kClassBits = kClassIds - 1;
  uint16_t bits = 0;
};

}  // namespace senseloom
