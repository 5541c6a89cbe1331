#include "proc/proc_nm.h"

#include <algorithm>

#include "bytes.h"

namespace senseloom {

ProcNM::ProcNM(int elementSize, EqualFunc equal, CheckSeqFunc checkSeq, int bufferLength)
    : ProcNM(elementSize, equal, checkSeq, bufferLength,
             Batch(new uint8_t[static_cast<size_t>(std::max(bufferLength, 0)) * static_cast<size_t>(elementSize)])) {}

bool ProcNM::gather(const void* data, int count) {
  const int taken = std::min(count, bufferLength() - filled);
  if (taken <= 0) return false;
  const auto size = static_cast<size_t>(elemSize);
  uint8_t* const end = buffer() + static_cast<size_t>(filled) * size;
  filled += taken;
  copyBytes<sizeof(uint16_t)>(end, data, static_cast<size_t>(taken) * size);
  return filled == bufferLength();
}

}  // namespace senseloom
