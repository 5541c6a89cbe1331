#pragma once

#include <stdexcept>

namespace senseloom::tool {

// What is wrong with what the user gave: the message says it to the user, and the tool ends with status 2.
class InputError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

}  // namespace senseloom::tool
