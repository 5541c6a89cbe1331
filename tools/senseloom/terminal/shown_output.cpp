#include "terminal/shown_output.h"

#include <poll.h>

#include <csignal>

#include "exit_status.h"

namespace senseloom::tool {

void showSoFar(std::FILE* out, bool writesMore) {
  pollfd output{.fd = fileno(out), .events = 0, .revents = 0};
  const bool isUnread = poll(&output, 1, 0) > 0 && (output.revents & POLLERR) != 0;
  if (!isUnread) {
    std::fflush(out);
  } else if (!writesMore) {
    throw ExitStatus{.status = 1, .signal = SIGPIPE};
  }
}

}  // namespace senseloom::tool
