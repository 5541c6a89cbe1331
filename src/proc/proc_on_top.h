#pragma once

#include <cstddef>
#include <cstdint>

namespace senseloom {

// A stage that acts on the complete batch of the stage before it, in that one's place.
template <class Previous>
class ProcOnTop {
 public:
  static constexpr size_t kElementSize = Previous::kElementSize;

  uint8_t* buffer() { return prev.buffer(); }
  int length() const { return prev.length(); }
  int bufferLength() const { return prev.bufferLength(); }
  void reset() { prev.reset(); }

 protected:
  template <class... Arguments>
  explicit ProcOnTop(Arguments... ofPrevious) : prev(ofPrevious...) {}

  Previous prev;
};

}  // namespace senseloom
