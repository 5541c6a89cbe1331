#include "proc/proc_mask.h"

namespace senseloom {

bool ProcMask::accept(const void* data, int count) {
  if (count < 0 || data == nullptr || !prev->accept(data, count)) return false;
  uint8_t* element = prev->buffer();
  for (int left = prev->length(); left > 0; --left, element += elemSize) maskFunc(element, maskArg);
  return true;
}

}  // namespace senseloom
