#pragma once

namespace senseloom::tool {

// While one lives, the signals that ask the tool to end (SIGINT, SIGTERM) only set a mark, for the command to end in
// good order: with its summary, and with whole files. A second signal of the same kind ends the tool at once.
class InterruptMark {
 public:
  InterruptMark();
  ~InterruptMark();
  InterruptMark(const InterruptMark&) = delete;
  InterruptMark& operator=(const InterruptMark&) = delete;
};

bool isInterrupted();

// For a command that is ended in no other way.
void forgetInterrupt();

// Ends the tool by the signal that interrupted it; returns if none did.
void endByInterrupt();

}  // namespace senseloom::tool
