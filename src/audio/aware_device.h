#pragma once

#include <hardware/hardware.h>

#include <cstddef>
#include <cstdint>

// What the audio bridge relies on of the platform's aware audio device. What the numbers mean is the device's affair.
struct AwareParameters {
  int32_t word0;
  int16_t half4;
  int16_t half6;
  int16_t half8;
  int32_t word12;
  int32_t word16;
  int32_t word20;
  int32_t word24;
  int32_t word28;
  int32_t word32;
  int32_t word36;
  int32_t word40;
  int16_t half44;
  int16_t half46;
};
static_assert(sizeof(AwareParameters) == 48);
static_assert(offsetof(AwareParameters, half8) == 8 && offsetof(AwareParameters, word12) == 12 &&
              offsetof(AwareParameters, word40) == 40 && offsetof(AwareParameters, half46) == 46);

struct aware_hw_device {
  hw_device_t common;
  int (*activate)(aware_hw_device*, const AwareParameters*);  // 0: success
  int (*deactivate)(aware_hw_device*);                        // 0: success
};
