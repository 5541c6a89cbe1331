#pragma once

#include <memory>
#include <vector>

#include "option/option.h"
#include "session/session.h"

namespace senseloom {

// One named sensor: makes sessions of its kind, knows the open ones, and owns their merged option.
class ContextSensor {
 public:
  virtual ~ContextSensor() = default;

  // A new session with the default option of its kind, which the caller owns.
  virtual Session* createSession() const = 0;

  // Called before the first session is opened and after the last was closed, for kinds that depend on a platform
  // service. False makes the opening or closing fail.
  virtual bool onStart() { return true; }
  virtual bool onStop() { return true; }

  std::unique_ptr<Option> mergedOption;  // null until the first negotiation
  std::vector<Session*> sessions;        // the open ones, in opening order; not owned
};

// The sensor of that name; null for null, for any other name, and before the sensors were made for the first time. The
// registry defines it.
ContextSensor* findSensor(const char* name) noexcept;

}  // namespace senseloom
