#pragma once

#include "command.h"

namespace senseloom::tool {

Declare declareRecord;

}  // namespace senseloom::tool
