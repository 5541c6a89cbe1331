#include "audio/audio_hal.h"
#include "senseloom.h"

bool audio_hal_init() noexcept {
  return senseloom::openAudio();
}

bool audio_hal_activate() noexcept {
  return senseloom::activateAudio();
}

bool audio_hal_deactivate() noexcept {
  return senseloom::deactivateAudio();
}
