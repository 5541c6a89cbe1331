#pragma once

#include "command.h"

namespace senseloom::tool {

Declare declareSensors;

}  // namespace senseloom::tool
