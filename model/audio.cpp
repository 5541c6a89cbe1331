#include "audio.h"

#include <cstring>

namespace senseloom::model {
namespace {

constexpr const char* kAudioTag = "aware_audio";
constexpr uint32_t kVersion = 0x200;

}  // namespace

bool Audio::open(const Answers& answers, Outcome& outcome) {
  if (isOpen) {
    write(outcome.log, kDebug, kAudioTag, "It is already inited!");
    return true;
  }
  outcome.calls.emplace_back("get aware.primary");
  write(outcome.log, kDebug, kAudioTag, "bool audio_hal_init() load audio hw module aware.primary (%s)",
        std::strerror(-answers.get));
  if (answers.get != 0) return false;
  outcome.calls.emplace_back("open aware_hw_if");
  write(outcome.log, kDebug, kAudioTag, "device open result %d\n", answers.open);
  if (answers.open != 0 || !answers.gives) return false;
  isOpen = true;
  write(outcome.log, kDebug, kAudioTag, "device version %d\n", static_cast<int>(answers.version));
  return answers.version == kVersion;
}

bool Audio::activate(const Answers& answers, const void* address, Outcome& outcome) {
  if (!open(answers, outcome)) {
    write(outcome.log, kError, kAudioTag, "init audio hal failed");
    return false;
  }
  if (isActive) {
    write(outcome.log, kDebug, kAudioTag, "already activated, return");
    return true;
  }
  write(outcome.log, kDebug, kAudioTag, "activating aware... %p\n", address);
  outcome.calls.emplace_back("activate");
  isActive = answers.activate == 0;
  if (isActive) {
    write(outcome.log, kDebug, kAudioTag, "activated aware successful...\n");
  } else {
    write(outcome.log, kError, kAudioTag, "activated aware failed\n");
  }
  return isActive;
}

bool Audio::deactivate(const Answers& answers, Outcome& outcome) {
  if (!open(answers, outcome)) {
    write(outcome.log, kError, kAudioTag, "init audio hal failed");
    return false;
  }
  if (!isActive) {
    write(outcome.log, kDebug, kAudioTag, "already deactivated, return");
    return true;
  }
  outcome.calls.emplace_back("puts deactivating aware session...");
  outcome.calls.emplace_back("deactivate");
  if (answers.deactivate != 0) {
    write(outcome.log, kError, kAudioTag, "deactivated aware session failed \n");
    return false;
  }
  write(outcome.log, kDebug, kAudioTag, "deactivated aware session successful... \n");
  outcome.calls.emplace_back("close");
  isActive = isOpen = false;
  return true;
}

}  // namespace senseloom::model
