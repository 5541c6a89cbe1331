#pragma once

#include "command.h"

namespace senseloom::tool {

Declare declareWatch;

}  // namespace senseloom::tool
