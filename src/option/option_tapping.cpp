#include "option/option_tapping.h"

namespace senseloom {

void OptionTapping::adjust(const Values& /*read*/) {
  // A bad level is kept and empties the class mask instead, on purpose: such a client gets no taps at all, unlike a
  // flick client, whose bad level becomes 0.
  if (!kind.keys[1].range.contains(level())) settings[0] = 0;
}

}  // namespace senseloom
