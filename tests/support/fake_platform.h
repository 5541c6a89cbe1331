#pragma once

#include <hardware/hardware.h>

#include <array>
#include <cstdint>
#include <deque>
#include <optional>
#include <string>
#include <vector>

// Fakes of the three platform libraries, for programs that test the library: the functions that it imports from liblog,
// libhardware and libgesture, which record each call and answer as they are told. They are the test program's own and
// so stand before those of the real libraries.
namespace fake {

struct LogLine {
  int priority;
  std::string tag;
  std::string text;
  bool operator==(const LogLine&) const = default;
};
// Shows a line in the messages of failed assertions.
void PrintTo(const LogLine& line, std::ostream* out);

struct Platform {
  // liblog
  std::vector<LogLine> log;

  // libhardware. `calls` names each call and what matters of its arguments: "get aware.primary", "open aware_hw_if",
  // "activate", "deactivate", "close".
  std::vector<std::string> calls;
  int getResult = 0;
  int openResult = 0;
  bool openGivesDevice = true;
  uint32_t deviceVersion = 0x200;
  int activateResult = 0;
  int deactivateResult = 0;
  std::array<uint8_t, 48> activationBlock{};  // as the last activation got it
  const void* deviceAddress() const;

  // libgesture. `groups` holds each group fed, with whether it was its record's last.
  struct Group {
    std::array<int16_t, 6> samples;
    int count;
    bool last;
    bool operator==(const Group&) const = default;
  };
  std::vector<Group> groups;
  std::deque<std::optional<std::string>> gestureNames;  // answers to the next groups; none left: no gesture
  bool gestureStarts = true;
  std::vector<std::array<int, 2>> gestureInitials;  // arguments of each call
  int gestureCloses = 0;

  // Takes the log lines so far.
  std::vector<LogLine> takeLog();
};

// The one platform of the process. Each test runs in a process of its own, so it starts fresh.
Platform& platform();

}  // namespace fake
