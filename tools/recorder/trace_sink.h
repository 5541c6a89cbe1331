#pragma once

#include <string>
#include <string_view>

namespace senseloom::trace {

// Where the lines of a recording go. Nothing that goes wrong reaches the program: no signal is raised, and what cannot
// be written whole is not written at all.
class TraceSink {
 public:
  virtual ~TraceSink() = default;

  // Returns why the lines were not written, or null.
  virtual const char* append(std::string_view lines) = 0;

  // Gives back what was reserved beyond the lines.
  virtual void finish() {}

  // Whether all parts of a recording go to it, one after the other.
  virtual bool takesAllParts() const { return false; }
};

// What an attempt to open a file gave: a sink, or the reason why there is none.
struct OpenedSink {
  TraceSink* sink = nullptr;
  const char* trouble = nullptr;
};

// Locks a file or a pipe for a recording. Returns why that is not possible, or null.
const char* takeLock(int descriptor);

// Opens a new file, or a pipe or a device. `replaces` is the identity of a file with content that may be replaced.
OpenedSink openSink(const std::string& name, const std::string& replaces);

// Opens a new file that nobody has yet; the trouble is EEXIST's if somebody has.
OpenedSink openNewFile(const std::string& name);

}  // namespace senseloom::trace
