#include "proc/proc_mixer.h"

namespace senseloom {

bool ProcMixer::accept(const void* data, int count) {
  if (count < 0 || data == nullptr || mixed || !prev->accept(data, count)) return false;
  mix();
  mixed = true;
  return true;
}

void ProcMixer::reset() {
  prev->reset();
  mixed = false;
}

}  // namespace senseloom
