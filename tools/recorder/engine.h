#pragma once

#include <gesture.h>

namespace senseloom::trace {

// The platform's function that the recording library stands in for: the next one behind its own, where names are looked
// for. Null if there is none.
decltype(&gesture_process_single_data) engine();

}  // namespace senseloom::trace
