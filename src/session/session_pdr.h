#pragma once

#include <array>
#include <cstdint>
#include <span>

#include "option/option_pdr.h"
#include "session/session.h"

namespace senseloom {

// Pedestrian dead reckoning: gathers the items of several records into one result of at least 2^N items, with the
// timestamp of the last record. What is pending survives a change of the option, whose `N` then applies to it.
class SessionPDR final : public SessionOf<OptionPDR> {
 public:
  int postProcess(void* data, int len, void** out, int* outLen) noexcept override;

 private:
  // Hands out what is pending. Out of line: most records deliver nothing.
  [[gnu::noinline]] int deliver(std::span<const uint8_t> lastRecord, void** out, int* outLen);

  static constexpr int kMostItems = 64;  // 2^N for the largest N
  static constexpr int kItemSize = 28;   // bytes; opaque to the library

  std::array<uint8_t, 10 + kMostItems * kItemSize> work{};
  int32_t pendingCount = 0;  // items in `work` that are not delivered yet
};

}  // namespace senseloom
