#include "proc/proc_nm.h"

#include <algorithm>
#include <cstring>

namespace senseloom {

ProcNM::ProcNM(int elementSize, EqualFunc equal, CheckSeqFunc checkSeq, int bufferLength)
    : Proc(elementSize, equal),
      checkSeqFunc(checkSeq),
      capacity(bufferLength),
      batch(new uint8_t[static_cast<size_t>(std::max(bufferLength, 0)) * static_cast<size_t>(elementSize)]) {}

bool ProcNM::accept(const void* data, int count) {
  if (count < 0 || data == nullptr || filled >= capacity) return false;
  const int taken = std::min(count, capacity - filled);
  std::memcpy(batch.get() + filled * elemSize, data, static_cast<size_t>(taken * elemSize));
  filled += taken;
  return filled == capacity;
}

}  // namespace senseloom
