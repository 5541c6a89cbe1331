#pragma once

#include "command.h"

namespace senseloom::tool {

Declare declareInfo;

}  // namespace senseloom::tool
