#include "proc/proc_change.h"

#include <cstring>

namespace senseloom {

bool ProcChange::process() {
  if (remembers && !differs()) {
    reset();
    return false;
  }
  // The batch's last element is remembered, not the one that differed, on purpose: A B A after A is let through, and A
  // stays remembered.
  std::memcpy(last.get(), buffer() + (length() - 1) * elemSize, static_cast<size_t>(elemSize));
  remembers = true;
  return true;
}

bool ProcChange::differs() const {
  const uint8_t* element = buffer();
  for (int left = length(); left > 0; --left, element += elemSize) {
    if (!equalFunc(element, last.get())) return true;
  }
  return false;
}

}  // namespace senseloom
