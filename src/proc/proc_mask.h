#pragma once

#include <cstddef>
#include <cstdint>

namespace senseloom {

// Rewrites every element of a complete batch in place, by kMask(element, maskArg).
template <class Previous, void (*kMask)(void*, int)>
class ProcMask {
 public:
  static constexpr size_t kElementSize = Previous::kElementSize;

  ProcMask() = default;
  template <class... Arguments>
  explicit ProcMask(int arg, Arguments... ofPrevious) : prev(ofPrevious...), maskArg(arg) {}

  bool accept(const void* data, int count) {
    if (!prev.accept(data, count)) return false;
    uint8_t* element = buffer();
    for (int left = length(); left > 0; --left, element += kElementSize) kMask(element, maskArg);
    return true;
  }

  uint8_t* buffer() { return prev.buffer(); }
  int length() const { return prev.length(); }
  int bufferLength() const { return prev.bufferLength(); }
  void reset() { prev.reset(); }

 private:
  Previous prev;
  int maskArg = 0;
};

}  // namespace senseloom
