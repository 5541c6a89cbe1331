#pragma once

#include "command.h"

namespace senseloom::tool {

Declare declareExplain;

}  // namespace senseloom::tool
