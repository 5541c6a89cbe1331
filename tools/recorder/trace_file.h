#pragma once

#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/types.h>

#include <cstddef>
#include <string_view>

namespace senseloom::trace {

// The file named by the environment variable SENSELOOM_TRACE, written a line at a time by one process. It is opened for
// the first line, so programs that never call the library do not touch it. Without the variable there is no file.
//
// Trouble with the file does not reach the program: no call fails, no signal is raised, and a line that cannot be
// written whole is left out and counted. The log says when that begins. The number of missing lines is written as a
// note before the next line that can be written, or else logged at the end of the process.
class TraceFile {
 public:
  // Whether this process writes lines: it needs a file, and must not be a child of the process that opened it.
  bool isWanted() noexcept;

  void write(std::string_view line) noexcept;
  // Counts a line that could not be put together, or that was not written.
  void lose(const char* reason) noexcept;
  // At the end of the process.
  void reportLost() const noexcept;

 private:
  void open() noexcept;
  bool append(std::string_view note, std::string_view line) noexcept;
  bool isStillOpen(struct stat& now) const noexcept;

  pid_t owner = 0;  // 0: not known yet whether a file is wanted
  bool isNamed = false;
  int descriptor = -1;            // -1: not open
  const char* trouble = nullptr;  // why it is not
  struct stat opened {};
  rlim_t mostBytes = 0;
  size_t lost = 0;  // lines, since the last note
};

}  // namespace senseloom::trace
