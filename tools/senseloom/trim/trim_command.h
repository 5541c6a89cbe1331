#pragma once

#include "command.h"

namespace senseloom::tool {

Declare declareTrim;

}  // namespace senseloom::tool
