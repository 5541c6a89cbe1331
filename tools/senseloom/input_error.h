#pragma once

#include <stdexcept>

namespace senseloom::tool {

// Something is wrong with what the user gave. The tool prints the message and ends with status 2.
class InputError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

}  // namespace senseloom::tool
