#pragma once

#include "command.h"

namespace senseloom::tool {

Declare declareGenerate;

}  // namespace senseloom::tool
