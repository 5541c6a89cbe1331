#pragma once

#include <sys/types.h>

#include <string>

#include "recorder/control_memory.h"

namespace senseloom::tool {

// A running process with the recording library, whoever started it: its control memory.
class ProcessControl {
 public:
  // Throws InputError when there is no such process, when it has not called the library through the recording library,
  // or when the user may not look into it.
  explicit ProcessControl(pid_t id);
  ~ProcessControl();
  ProcessControl(const ProcessControl&) = delete;
  ProcessControl& operator=(const ProcessControl&) = delete;

  bool isAlive() const;
  bool isRecording() const { return memory->isRecording != 0; }

  // Gives an order, which the process reads with its next call of the library.
  void give(const std::string& order);
  // What the process has answered; empty as long as it has not.
  std::string answer() const;
  // Takes back an order that was not read yet.
  void takeBack();

  // What is in force: lines as in a trace.
  std::string state() const;
  const trace::SessionCounts* countsOf(uint32_t session) const;

 private:
  const pid_t process;
  int descriptor = -1;
  trace::ControlMemory* memory = nullptr;
};

}  // namespace senseloom::tool
