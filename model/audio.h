#pragma once

#include "outcome.h"

namespace senseloom::model {

// The platform's audio session, which is on while the audio sensor has sessions.
class Audio {
 public:
  // Each returns whether it went well. `address` is that of the device, for the log.
  bool open(const Answers& answers, Outcome& outcome);
  bool activate(const Answers& answers, const void* address, Outcome& outcome);
  bool deactivate(const Answers& answers, Outcome& outcome);

  bool deviceOpen() const { return isOpen; }
  bool active() const { return isActive; }
  bool operator==(const Audio&) const = default;

 private:
  bool isOpen = false;
  bool isActive = false;
};

}  // namespace senseloom::model
