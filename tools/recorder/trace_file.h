#pragma once

#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/types.h>

#include <cstddef>
#include <string_view>

namespace senseloom::trace {

// The file that the environment variable SENSELOOM_TRACE names, written a line at a time by one process. It is opened
// for the first line, so that programs that never call the library leave it alone; without the variable there is none.
//
// Whatever goes wrong with it stays with it: no call fails, no signal is raised, and a line that can not be written
// whole is left out and counted. The log says when that begins; a note in the file says how many lines are missing,
// ahead of the next one that can be written, or else the log does at the end of the process.
class TraceFile {
 public:
  // Whether this process is to write lines: not without a file, and not in a child of the process that opened it.
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
  int descriptor = -1;            // -1: not open,
  const char* trouble = nullptr;  // ... for this reason
  struct stat opened {};
  rlim_t mostBytes = 0;
  size_t lost = 0;  // lines, since the last note
};

}  // namespace senseloom::trace
