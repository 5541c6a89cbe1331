#pragma once

#include <memory>
#include <vector>

#include "option/option.h"
#include "session/session.h"

namespace senseloom {

// One named sensor: makes sessions of its kind, knows the open ones, and owns what their options became together.
class ContextSensor {
 public:
  virtual ~ContextSensor() = default;

  // A new session with the default option of its kind.
  virtual std::unique_ptr<Session> createSession() const = 0;

  // Called before the first session is opened and after the last was closed, for kinds that depend on a platform
  // service. False makes the opening or closing fail.
  virtual bool onStart() { return true; }
  virtual bool onStop() { return true; }

  std::unique_ptr<Option> mergedOption;  // null until the first negotiation
  std::vector<Session*> sessions;        // the open ones, in opening order; owned by nobody but their clients
};

}  // namespace senseloom
