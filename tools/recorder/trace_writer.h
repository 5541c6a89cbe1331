#pragma once

#include <sys/types.h>

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>

#include "summary.h"
#include "trace_order.h"
#include "trace_sink.h"

namespace senseloom::trace {

enum class LineKind {
  call,
  repeated,  // a call that was made before this part
  note,      // or a release: what does not count as a call
  head,
};

// The recording of one process: its file or, with a limit, one file a part. Lines that cannot be written are counted:
// a note before the next line that can be says how many are missing, the line at the end of the part how many in all.
class TraceWriter {
 public:
  // Opens the file of the order; a file that cannot be opened loses all lines.
  TraceWriter(const TraceOrder& order, const Summary& sharedSummary);
  TraceWriter(const TraceWriter&) = delete;
  TraceWriter& operator=(const TraceWriter&) = delete;

  // Why there is no file; null if there is one.
  const char* trouble() const { return noSink; }
  const std::string& file() const { return name; }

  // Whether this part has calls of its own, and is as long as it may become.
  bool isFull() const;
  // Ends this part and begins the next one in another file, if that can be opened. Returns whether it did.
  bool beginPart();
  uint32_t part() const { return parts; }

  // Once ended, every line is followed by a new end, since calls can be made until the process is gone.
  void write(std::string_view line, LineKind kind);
  // Counts a line that could not be put together.
  void lose(const char* why);
  void breached(const std::string& breach) { summary.breached(breach); }
  void end();

  // In a child process, which has no part in it.
  void abandon() { sink.reset(); }

  // What is to be logged, since lines began to be lost; empty: nothing new. Not logged at once, because a logger may
  // call the library.
  std::string takeWarning();
  uint64_t missingAtEnd() const { return lost; }

 private:
  void writeEnd();
  const char* append(std::string_view line);
  std::string nextName();

  const TraceOrder order;
  const Summary& summary;
  std::string name;
  std::unique_ptr<TraceSink> sink;
  const char* noSink = nullptr;
  uint32_t parts = 1;
  uint32_t lastNumber = 1;  // that a part's file has in its name
  uint64_t partSize = 0;    // bytes
  uint64_t mostOfPart = 0;  // bytes; grows when no next part could be begun
  uint64_t calls = 0;       // in this part
  bool hasNewCalls = false;
  uint64_t lost = 0;  // since the last note
  uint64_t lostInAll = 0;
  const char* why = nullptr;  // the lost lines were lost, the last time
  bool isEnded = false;
  std::string warning;
};

}  // namespace senseloom::trace
