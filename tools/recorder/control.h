#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "control_memory.h"
#include "own_descriptor.h"

namespace senseloom::trace {

// The word of the control memory that every call looks at; without such memory, one that never changes.
struct Bell {
  static inline const uint32_t silence = 0;

  // Whether an order may have come since the last one was read.
  bool isRung() const { return __atomic_load_n(word, __ATOMIC_ACQUIRE) != heard; }

  const uint32_t* word = &silence;
  uint32_t heard = 0;
};
extern constinit Bell gBell;

// The process's side of its control memory. Without it, because the system has no such files or refuses one, nobody can
// look into the process or give it orders, and everything else is as usual.
class Control {
 public:
  ~Control();

  void open();
  // In a child process, which shares its parent's memory but must not use it.
  void abandon();

  // The order, without its line feed, if it is there and complete.
  std::optional<std::string> takeOrder();
  void answer(const std::string& text);
  void setRecording(bool isRecording);

  // Adds to what is in force. Returns whether it grew so much that it should be told anew.
  bool tell(std::string_view line);
  // Between the two, the lines told are all there are.
  void beginAnew();
  void endAnew();

  // Counts of a session, at a place that is never used for anything else; nobody sees those of more sessions than fit.
  SessionCounts* countsFor(uint32_t session);
  void forget(SessionCounts* counts);

 private:
  bool reserve(size_t size);

  OwnDescriptor descriptor;
  ControlMemory* memory = nullptr;
  char* state = nullptr;    // what is in force
  size_t stateRoom = 0;     // bytes
  size_t stateSize = 0;     // bytes
  size_t sizeWhenAnew = 0;  // bytes
  std::vector<SessionCounts*> spare;
};

}  // namespace senseloom::trace
