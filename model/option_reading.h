#pragma once

#include <vector>

#include "log.h"
#include "reasons.h"
#include "request.h"
#include "templates.h"

namespace senseloom::model {

// What the reading of an option string works on.
struct ReadingPlace {
  Templates& templates;
  Log& log;
  std::vector<Remark>* remarks;  // null: none are wanted
};

// Reads an option string, which is not null, into a session's request. Returns whether the sensor goes on to negotiate.
// A string that cannot be read for want of memory is treated as one that is not JSON.
bool readOption(Request& request, const char* text, bool hasMemory, const ReadingPlace& place);

}  // namespace senseloom::model
