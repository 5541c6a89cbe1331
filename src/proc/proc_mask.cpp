#include "proc/proc_mask.h"

namespace senseloom {

bool ProcMask::process() {
  uint8_t* element = buffer();
  for (int left = bufferLength(); left > 0; --left, element += elemSize) maskFunc(element, maskArg);
  return true;
}

}  // namespace senseloom
