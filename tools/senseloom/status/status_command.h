#pragma once

#include "command.h"

namespace senseloom::tool {

Declare declareStatus;

}  // namespace senseloom::tool
