#pragma once

#include <functional>

#include "call.h"

namespace oracle {

// The least that is left of a sequence that fails: calls are taken away, and what is left of them is made simpler, as
// long as it fails. No single call of the outcome can be spared.
Sequence shrink(Sequence sequence, const std::function<bool(const Sequence&)>& fails);

}  // namespace oracle
