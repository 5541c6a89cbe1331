#pragma once

#include <array>
#include <cstddef>
#include <cstdint>

namespace senseloom {

// Reduces each complete batch of the stage before it to one element: mix(previous stage, result) writes it.
template <class Previous, class Mix>
class ProcMixer {
 public:
  static constexpr size_t kElementSize = Previous::kElementSize;

  ProcMixer() = default;
  template <class... Arguments>
  explicit ProcMixer(Mix how, Arguments... ofPrevious) : prev(ofPrevious...), mix(how) {}

  bool accept(const void* data, int count) {
    // Asked first: most offers end there, as all do that come before the stage is reset.
    if (!prev.accept(data, count) || mixed) return false;
    mix(prev, result.data());
    return mixed = true;
  }

  uint8_t* buffer() { return result.data(); }
  int length() const { return mixed ? 1 : 0; }
  int bufferLength() const { return 1; }
  void reset() {
    prev.reset();
    mixed = false;
  }

 private:
  Previous prev;
  Mix mix;
  std::array<uint8_t, kElementSize> result{};
  bool mixed = false;  // whether `result` holds the element of a batch
};

}  // namespace senseloom
