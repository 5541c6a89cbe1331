#pragma once

namespace senseloom::tool {

// Ends the tool, once everything is printed, as another program ended: with its status, or by the signal that ended it.
struct ExitStatus {
  int status;
  int signal = 0;  // 0: none
};

}  // namespace senseloom::tool
