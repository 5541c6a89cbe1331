#pragma once

#include <array>
#include <cstdint>

#include "option/option_class_masks.h"
#include "session/session.h"

namespace senseloom {

// Hand-drawn gestures: feeds the motion samples of each record to the platform's gesture engine and delivers the record
// with the number of the recognised class, if the client asked for that class. One engine serves all gesture sessions,
// and a record that several of them get is recognised once: it is identified by its timestamp, so different records
// must carry different timestamps.
class SessionGestureHMM final : public SessionOf<OptionGestureHMM> {
 public:
  SessionGestureHMM();
  ~SessionGestureHMM() override;

  int postProcess(void* data, int len, void** out, int* outLen) noexcept override;

 private:
  static constexpr int kMostBytes = 2052;  // the largest record

  std::array<uint8_t, kMostBytes> work{};
};

}  // namespace senseloom
