#include "option/option_tapping.h"

namespace senseloom {

void OptionTapping::adjust(const Settings& /*given*/) {
  // A bad level is kept and empties the class mask instead, on purpose: such a client gets no taps at all, unlike a
  // flick client, whose bad level becomes 0.
  constexpr size_t kLevel = kind.key("level");
  if (!kind.keys[kLevel].range.contains(setting<kLevel>())) set<kind.key("classMask")>(0);
}

}  // namespace senseloom
