#pragma once

#include <string>

namespace senseloom::trace {

// What the process is to record from its first call on, in the words of trace_order.h: the environment variable
// SENSELOOM_TRACE or, on a device where it is not set, the property debug.senseloom.trace. Empty: nothing.
std::string startOrder();

}  // namespace senseloom::trace
