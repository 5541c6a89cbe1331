#include "proc/proc_change.h"

#include <cstring>

namespace senseloom {

bool ProcChange::accept(const void* data, int count) {
  if (count < 0 || data == nullptr || !prev->accept(data, count)) return false;
  if (remembers && !differs()) {
    prev->reset();
    return false;
  }
  // The batch's last element is remembered, not the one that differed, on purpose: A B A after A is let through, and A
  // stays remembered.
  std::memcpy(last.get(), prev->buffer() + (prev->length() - 1) * elemSize, static_cast<size_t>(elemSize));
  remembers = true;
  return true;
}

bool ProcChange::differs() const {
  const uint8_t* element = prev->buffer();
  for (int left = prev->length(); left > 0; --left, element += elemSize) {
    if (!equalFunc(element, last.get())) return true;
  }
  return false;
}

}  // namespace senseloom
