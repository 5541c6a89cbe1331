#pragma once

#include "command.h"

namespace senseloom::tool {

Declare declareReplay;

}  // namespace senseloom::tool
