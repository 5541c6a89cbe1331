#pragma once

#include "command.h"

namespace senseloom::tool {

Declare declareConvert;

}  // namespace senseloom::tool
