#pragma once

#include "command.h"

namespace senseloom::tool {

Declare declareSense;

}  // namespace senseloom::tool
