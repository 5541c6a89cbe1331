#pragma once

#include <string>

#include "call.h"

namespace oracle {

// What `senseloom explain` says of a sequence of calls, made on the library through the tool's own replay: of those
// calls that a trace can express. Leaves the library as it was.
std::string explained(const Sequence& sequence);

}  // namespace oracle
