#include "proc/proc_mixer_pedo.h"

#include <cstring>

namespace senseloom {

void ProcMixerPedo::mix() {
  std::memcpy(buffer(), prev->buffer() + (prev->length() - 1) * elemSize, static_cast<size_t>(elemSize));
}

}  // namespace senseloom
