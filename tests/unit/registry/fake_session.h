#pragma once

#include <cstdio>
#include <string>
#include <utility>

#include "fake_option.h"
#include "fake_platform.h"
#include "session/session.h"

namespace fake {

// A session that tells what happens to it, and to its option of the same name, in words.
class NamedSession final : public senseloom::Session {
 public:
  using Events = NamedOption::Events;

  NamedSession(const char* sensor, std::string ownName, Events& story)
      : Session(sensor, own), label(ownName), events(story), own(std::move(ownName), story) {}
  ~NamedSession() override { events.push_back("session " + label + " destroyed"); }

  int postProcess(void* data, int len, void** out, int* outLen) noexcept override {
    events.push_back(label + " takes " + std::to_string(len) + " bytes");
    if (processResult == 1) passThrough(data, len, out, outLen);
    return processResult;
  }
  int buildProc() override {
    events.push_back(label + " built");
    return buildResult;
  }

  const std::string label;
  int processResult = 1;
  int buildResult = 0;

 private:
  Events& events;

 public:
  NamedOption own;
};

// The line that tells of a session being merged.
inline LogLine mergeLine(int index, int count, const senseloom::Session& session) {
  char address[32];
  std::snprintf(address, sizeof address, "%p", static_cast<const void*>(&session));
  return {4, "Libsl",
          "The " + std::to_string(index) + " of " + std::to_string(count) + " session of sensor " + session.name +
              " has " + address + " option!\n"};
}

}  // namespace fake
