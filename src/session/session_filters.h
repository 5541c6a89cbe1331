#pragma once

#include "option/option_audio_classification.h"
#include "option/option_class_masks.h"
#include "option/option_dtwgs.h"
#include "option/option_step_count.h"
#include "option/option_tapping.h"
#include "session/record.h"
#include "session/session.h"

// The session kinds that decide about each record by itself and hand it back as it is, or not at all. They read the
// session's own option and not the sensor's merged one: the sensor runs for all clients, the session keeps what its own
// client asked for.
namespace senseloom {

// Which records a kind delivers: `wants` is asked about every record of at least `kFieldEnd` bytes; shorter ones are
// not delivered.

// The value is the number of a class, from 1. Its place in the mask is taken modulo 32 on purpose: class 0 is bit 31,
// class 33 is bit 0.
template <class Number>
struct ClassNumber {
  static constexpr size_t kFieldEnd = kValueOffset + sizeof(Number);
  template <class OptionClass>
  static bool wants(std::span<const uint8_t> record, const OptionClass& option) {
    const auto number = static_cast<uint32_t>(int32_t{load<Number>(record, kValueOffset)});
    return bitAt(option.classMask(), static_cast<int32_t>(number - 1));
  }
};

// The value is a set of classes itself, a bit each; one wanted class suffices. It is widened with its sign, so that a
// negative value has bits 16 to 31, too.
struct ClassSet {
  static constexpr size_t kFieldEnd = kValueOffset + sizeof(int16_t);
  template <class OptionClass>
  static bool wants(std::span<const uint8_t> record, const OptionClass& option) {
    return (loadI16(record, kValueOffset) & option.classMask()) != 0;
  }
};

struct Everything {
  static constexpr size_t kFieldEnd = 0;
  template <class OptionClass>
  static bool wants(std::span<const uint8_t>, const OptionClass&) {
    return true;
  }
};

template <class OptionClass, class Filter>
class SessionFilter final : public SessionOf<OptionClass> {
 public:
  int postProcess(void* data, int len, void** out, int* outLen) noexcept override {
    if (len < static_cast<int>(Filter::kFieldEnd)) return 0;
    if (!Filter::wants(recordBytes(data, len), this->wanted)) return 0;
    return this->passThrough(data, len, out, outLen);
  }
};

using SessionTapping = SessionFilter<OptionTapping, ClassSet>;
using SessionGestureFlick = SessionFilter<OptionGestureFlick, ClassNumber<int16_t>>;
using SessionShaking = SessionFilter<OptionShaking, Everything>;
using SessionInstantActivity = SessionFilter<OptionInstantActivity, ClassNumber<int32_t>>;
using SessionDTWGS = SessionFilter<OptionDTWGS, ClassSet>;
using SessionGestureEartouch = SessionFilter<OptionGestureEartouch, ClassNumber<int16_t>>;
using SessionAudioClassification = SessionFilter<OptionAudioClassification, Everything>;
using SessionLift = SessionFilter<OptionLift, Everything>;

}  // namespace senseloom
