/*
 * The aware audio device: the part of the audio hardware that keeps listening while its session is active. The layouts
 * are the binary interface between the module and its callers.
 */
#pragma once

#include <hardware/hardware.h>
#include <stddef.h>
#include <stdint.h>

#ifdef __cplusplus
extern "C" {
#endif

#define AWARE_HARDWARE_MODULE_ID "aware"
#define AWARE_HARDWARE_INTERFACE "aware_hw_if"
#define AWARE_DEVICE_API_VERSION_2_0 HARDWARE_DEVICE_API_VERSION(2, 0)

/* What a session is activated with. The meaning of the fields is undocumented; they are named by their offset. */
typedef struct aware_parameters {
  int32_t word0;
  int16_t half4;
  int16_t half6;
  int16_t half8; /* two bytes of padding follow */
  int32_t word12;
  int32_t word16;
  int32_t word20;
  int32_t word24;
  int32_t word28; /* this one to word40: fractions in Q15 */
  int32_t word32;
  int32_t word36;
  int32_t word40;
  int16_t half44;
  int16_t half46;
} aware_parameters_t;

typedef struct aware_hw_device {
  hw_device_t common; /* version AWARE_DEVICE_API_VERSION_2_0 */

  /*
   * Starts the session and keeps a copy of the parameters. Returns 0; -EBUSY when the session is active; -EINVAL when
   * the parameters are NULL or not those that the hardware is made for (the padding is not looked at).
   */
  int (*activate)(struct aware_hw_device* device, const aware_parameters_t* parameters);

  /* Ends the session. Returns 0, or -EINVAL when it is not active. */
  int (*deactivate)(struct aware_hw_device* device);

  /*
   * Copies the parameters that the session was activated with. Returns 0, or -EINVAL when it is not active. Of the
   * host's module alone; libsenseloom does not call it.
   */
  int (*get_parameters)(const struct aware_hw_device* device, aware_parameters_t* parameters);
} aware_hw_device_t;

#ifdef __cplusplus
static_assert(offsetof(aware_parameters_t, half8) == 8 && offsetof(aware_parameters_t, word12) == 12,
              "two bytes of padding after half8");
static_assert(offsetof(aware_parameters_t, word40) == 40 && offsetof(aware_parameters_t, half46) == 46,
              "no further padding");
static_assert(sizeof(aware_parameters_t) == 48, "parameters are exchanged in binary form");
static_assert(offsetof(aware_hw_device_t, activate) == sizeof(hw_device_t), "operations follow the common header");
static_assert(offsetof(aware_hw_device_t, deactivate) == sizeof(hw_device_t) + sizeof(void*),
              "operations are adjacent");
#elif __STDC_VERSION__ >= 201112L /* C99 has no such assertion */
_Static_assert(sizeof(aware_parameters_t) == 48, "parameters are exchanged in binary form");
#endif

#ifdef __cplusplus
}
#endif
