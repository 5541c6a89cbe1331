#pragma once

#include "model/log.h"
#include "model/outcome.h"

namespace senseloom::tool {

// What the platform must have answered during a call, as far as the lines tell that the library logged meanwhile.
model::Answers answersToldBy(const model::Log& log);

}  // namespace senseloom::tool
