#pragma once

#include "command.h"

namespace senseloom::tool {

Declare declareView;

}  // namespace senseloom::tool
