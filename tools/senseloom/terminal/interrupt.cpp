#include "terminal/interrupt.h"

#include <csignal>
#include <initializer_list>

namespace senseloom::tool {
namespace {

volatile std::sig_atomic_t caught = 0;

void mark(int number) {
  caught = number;
}

// Without SA_RESTART, so that a wait for input ends.
void handle(void (*handler)(int), int flags) {
  for (const int number : {SIGINT, SIGTERM}) {
    struct sigaction action {};
    action.sa_handler = handler;
    action.sa_flags = flags;
    sigaction(number, &action, nullptr);
  }
}

}  // namespace

InterruptMark::InterruptMark() {
  handle(mark, static_cast<int>(SA_RESETHAND));
}

InterruptMark::~InterruptMark() {
  handle(SIG_DFL, 0);
}

bool isInterrupted() {
  return caught != 0;
}

void forgetInterrupt() {
  caught = 0;
}

void endByInterrupt() {
  if (caught != 0) std::raise(caught);
}

}  // namespace senseloom::tool
