#pragma once

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <span>

#include "bytes.h"

namespace senseloom {

// A processing chain turns elements, blocks of a few bytes, into results. Its first stage, this one, gathers them into
// batches of a fixed number; every other stage holds the stage before it and acts on a batch once it is complete. The
// owner of a chain talks to the last stage alone:
//
//   if (last.accept(data, count)) { use length() elements at buffer(); last.reset(); }
//
// accept() offers `count` elements that lie back to back at `data` and returns whether a result is ready now; null data
// and a negative count change nothing. A chain with a result takes nothing more until it is reset. Stages know how
// large an element is; what it means is known to the functions that they are made with. The type of a chain spells its
// stages, so the compiler sees the whole way of an element.
template <size_t kSize>
class ProcNM {
 public:
  static constexpr size_t kElementSize = kSize;

  // A stage that holds nothing and refuses every offer.
  ProcNM() = default;
  // The batch is as large as the memory, which has to outlive the stage.
  explicit ProcNM(std::span<uint8_t> memory)
      : batch(memory.data()), capacity(static_cast<int>(memory.size() / kSize)) {}

  // Elements beyond the room of the batch are dropped and not kept for the next one, on purpose.
  bool accept(const void* data, int count) {
    const int taken = std::min(count, capacity - filled);
    if (taken <= 0 || data == nullptr) return false;
    uint8_t* const end = batch + static_cast<size_t>(filled) * kSize;
    filled += taken;
    copyBytes<kSize>(end, data, static_cast<size_t>(taken) * kSize);
    return filled == capacity;
  }

  uint8_t* buffer() const { return batch; }
  int length() const { return filled; }
  int bufferLength() const { return capacity; }  // elements of a complete batch
  void reset() { filled = 0; }

 private:
  uint8_t* batch = nullptr;
  int capacity = 0;
  int filled = 0;
};

}  // namespace senseloom
