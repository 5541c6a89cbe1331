#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace senseloom::trace {

// What to record, and how: the text of SENSELOOM_TRACE, and of an order to a running process. Words with a value come
// first, each followed by a blank; the rest is the name of the file, which may hold blanks:
//
//   max-size=N     a part that would become longer than N bytes is ended, and the next one begun
//   follow-forks=1 forked children are recorded, too
//   replaces=ID    a file with content is replaced if it is the one with this identity (see identityOf())
//   summary=FILE   where the memory of summary_memory.h is
//
// In the name %p becomes the id of the process.
struct TraceOrder {
  std::string file;
  uint64_t maxSize = 0;  // 0: without limit
  bool followForks = false;
  std::string replaces = {};
  std::string summary = {};

  std::string text() const;
};

// Nothing if no file is named.
std::optional<TraceOrder> readOrder(std::string_view text);

// A name with each %p replaced.
std::string nameFor(std::string_view file, int process);

// The name of a further part: ".N" goes before the extension, as in "trace.2.jsonl" and "trace.2.jsonl.gz".
std::string numberedName(const std::string& file, unsigned number);

// What tells a file with its content from any other: device, inode, size and time of the last change. Empty if there is
// no such file.
std::string identityOf(const std::string& file);

}  // namespace senseloom::trace
