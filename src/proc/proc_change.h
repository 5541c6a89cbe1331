#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <cstring>

#include "proc/proc_on_top.h"

namespace senseloom {

// Lets a complete batch through only when it differs from what was last let through, by kEqual(element, last); drops it
// otherwise. The first batch always passes. What is remembered survives reset().
template <class Previous, bool (*kEqual)(const void*, const void*)>
class ProcChange : public ProcOnTop<Previous> {
 public:
  using ProcOnTop<Previous>::kElementSize;

  template <class... Arguments>
  explicit ProcChange(Arguments... ofPrevious) : ProcOnTop<Previous>(ofPrevious...) {}

  bool accept(const void* data, int count) {
    if (!this->prev.accept(data, count)) return false;
    if (remembers && !differs()) {
      this->reset();
      return false;
    }
    // The batch's last element is remembered, not the one that differed, on purpose: A B A after A is let through, and
    // A stays remembered.
    std::memcpy(last.data(), this->buffer() + static_cast<size_t>(this->length() - 1) * kElementSize, kElementSize);
    remembers = true;
    return true;
  }

 private:
  bool differs() {
    const uint8_t* element = this->buffer();
    for (int left = this->length(); left > 0; --left, element += kElementSize) {
      if (!kEqual(element, last.data())) return true;
    }
    return false;
  }

  std::array<uint8_t, kElementSize> last{};  // the last element of the last batch let through
  bool remembers = false;                    // whether there was one
};

}  // namespace senseloom
