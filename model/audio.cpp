#include "audio.h"

#include <cstring>

namespace senseloom::model {
namespace {

constexpr const char* kAudioTag = "aware_audio";
constexpr uint32_t kVersion = 0x200;

// Says why the session is not switched, with the line that was logged about it.
bool fail(Outcome& outcome, const char* cause, const std::string& logged) {
  outcome.why.remarks.push_back(audioNotSwitched(cause, logged));
  return false;
}

}  // namespace

bool Audio::open(const Answers& answers, Outcome& outcome) {
  if (isOpen) {
    write(outcome.log, kDebug, kAudioTag, "It is already inited!");
    return true;
  }
  outcome.calls.emplace_back("get aware.primary");
  write(outcome.log, kDebug, kAudioTag, "bool audio_hal_init() load audio hw module aware.primary (%s)",
        std::strerror(-answers.get));
  if (answers.get != 0) return fail(outcome, "on: no module is loaded", "");
  outcome.calls.emplace_back("open aware_hw_if");
  const std::string& opened = write(outcome.log, kDebug, kAudioTag, "device open result %d\n", answers.open);
  if (answers.open != 0 || !answers.gives) return fail(outcome, "on: the module opens no device", opened);
  isOpen = true;
  const std::string& version =
      write(outcome.log, kDebug, kAudioTag, "device version %d\n", static_cast<int>(answers.version));
  return answers.version == kVersion || fail(outcome, "on: the device's version is not 2.0", version);
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
    fail(outcome, "on: the device refuses", write(outcome.log, kError, kAudioTag, "activated aware failed\n"));
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
    return fail(outcome, "off: the device refuses",
                write(outcome.log, kError, kAudioTag, "deactivated aware session failed \n"));
  }
  write(outcome.log, kDebug, kAudioTag, "deactivated aware session successful... \n");
  outcome.calls.emplace_back("close");
  isActive = isOpen = false;
  return true;
}

}  // namespace senseloom::model
