#pragma once

#include "command.h"

namespace senseloom::tool {

Declare declareSweep;

}  // namespace senseloom::tool
