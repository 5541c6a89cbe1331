#pragma once

#include "command.h"

namespace senseloom::tool {

Declare declareDiff;

}  // namespace senseloom::tool
