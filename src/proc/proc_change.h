#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <cstring>

namespace senseloom {

// Lets a complete batch through only when it differs from what was last let through, by kEqual(element, last); drops it
// otherwise. The first batch always passes. What is remembered survives reset().
template <class Previous, bool (*kEqual)(const void*, const void*)>
class ProcChange {
 public:
  static constexpr size_t kElementSize = Previous::kElementSize;

  ProcChange() = default;
  template <class First, class... Arguments>
  explicit ProcChange(First first, Arguments... ofPrevious) : prev(first, ofPrevious...) {}

  bool accept(const void* data, int count) {
    if (!prev.accept(data, count)) return false;
    if (remembers && !differs()) {
      reset();
      return false;
    }
    // The batch's last element is remembered, not the one that differed, on purpose: A B A after A is let through, and
    // A stays remembered.
    std::memcpy(last.data(), buffer() + static_cast<size_t>(length() - 1) * kElementSize, kElementSize);
    remembers = true;
    return true;
  }

  uint8_t* buffer() { return prev.buffer(); }
  int length() const { return prev.length(); }
  int bufferLength() const { return prev.bufferLength(); }
  void reset() { prev.reset(); }

 private:
  bool differs() {
    const uint8_t* element = buffer();
    for (int left = length(); left > 0; --left, element += kElementSize) {
      if (!kEqual(element, last.data())) return true;
    }
    return false;
  }

  Previous prev;
  std::array<uint8_t, kElementSize> last{};  // the last element of the last batch let through
  bool remembers = false;                    // whether there was one
};

}  // namespace senseloom
