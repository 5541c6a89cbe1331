#pragma once

#include "option/option_pdr.h"
#include "session/session.h"

namespace senseloom {

// Pedestrian dead reckoning: gathers the items of several records into one result of at least 2^N items, with the
// timestamp of the last record. What is pending survives a change of the option, whose `N` then applies to it.
class SessionPDR final : public Session {
 public:
  SessionPDR() : Session(OptionPDR::kind.sensor, std::make_unique<OptionPDR>()) {}

  int postProcess(void* data, int len, void** out, int* outLen) noexcept override;

 private:
  // Hands out what is pending. Apart from postProcess(), which most often has too little.
  [[gnu::noinline]] int deliver(std::span<const uint8_t> lastRecord, void** out, int* outLen);

  static constexpr int kMostItems = 64;  // 2^N for the largest N
  static constexpr int kItemSize = 28;   // bytes; what they mean is between the sensor and the client

  ResultBuffer<10 + kMostItems * kItemSize> work;
  int32_t pendingCount = 0;  // items in `work` that are not delivered yet
};

}  // namespace senseloom
