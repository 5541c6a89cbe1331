#include "watch/held_output.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <stdexcept>
#include <string>

namespace senseloom::tool {
namespace {

int replaceBy(int file, int descriptor) {
  if (isatty(descriptor) == 0) return -1;
  const int before = fcntl(descriptor, F_DUPFD_CLOEXEC, 0);
  dup2(file, descriptor);
  return before;
}

void putBack(int before, int descriptor) {
  if (before < 0) return;
  dup2(before, descriptor);
  close(before);
}

}  // namespace

HeldOutput::HeldOutput() : held(std::tmpfile()) {
  if (held == nullptr) throw std::runtime_error(std::string("no temporary file: ") + std::strerror(errno));
  std::fflush(stdout);
  fcntl(fileno(held), F_SETFL, O_APPEND);
  output = replaceBy(fileno(held), STDOUT_FILENO);
  errors = replaceBy(fileno(held), STDERR_FILENO);
}

HeldOutput::~HeldOutput() {
  std::fflush(stdout);
  putBack(output, STDOUT_FILENO);
  putBack(errors, STDERR_FILENO);
  std::rewind(held);
  char bytes[4096];
  while (const size_t count = std::fread(bytes, 1, sizeof bytes, held)) std::fwrite(bytes, 1, count, stderr);
  std::fclose(held);
}

}  // namespace senseloom::tool
