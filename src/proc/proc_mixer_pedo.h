#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>

#include "proc/proc_mixer.h"

namespace senseloom {

// The most recent value of a batch of 32-bit counts.
struct LatestCount {
  template <class Previous>
  void operator()(const Previous& previous, uint8_t* result) const {
    std::memcpy(result, previous.buffer() + static_cast<size_t>(previous.length() - 1) * sizeof(int32_t),
                sizeof(int32_t));
  }
};

// No session builds it.
template <class Previous>
using ProcMixerPedo = ProcMixer<Previous, LatestCount>;

}  // namespace senseloom
