#pragma once

#include <istream>
#include <string>
#include <vector>

#include "call.h"
#include "trace/json.h"

namespace oracle {

// A line of a case: a call, with what is expected of it in `line`, or a second look at the last list of a sensor.
struct Step {
  int lineNumber;
  Call call;
  int looksAt = -1;  // the sensor; -1: a call
  senseloom::tool::Json line;
};

struct Case {
  std::string name;
  std::string note;
  int lineNumber;
  std::vector<Step> steps;
  std::vector<std::string> sessions;  // the calls name them by their places here
};

// The cases of a file. Throws InputError with the file's name and the line when one is not as it should be.
std::vector<Case> readCases(std::istream& stream, const std::string& file);

}  // namespace oracle
