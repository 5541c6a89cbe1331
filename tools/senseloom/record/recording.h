#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>

#include "record/line_output.h"
#include "record/summary_report.h"
#include "record/unfinished_file.h"
#include "recorder/trace_order.h"

namespace senseloom::tool {

// What the user says about a recording.
struct RecordingArguments {
  std::string file = "trace.jsonl";  // "-": standard output
  bool force = false;
  uint64_t maxSize = 0;  // bytes of a part; 0: without limit
  bool followForks = false;
};

// A recording that another process makes, as the tool sees it: where the lines go, and what became of them. Lines for a
// pipe and for a compressed file come to the tool first, through a pipe of its own.
class Recording {
 public:
  // Checks that the recording would not overwrite anything. `out` is for "-". Throws InputError.
  Recording(const RecordingArguments& given, int out);
  ~Recording();
  Recording(const Recording&) = delete;
  Recording& operator=(const Recording&) = delete;

  // Whether its lines pass through the tool.
  bool passes() const { return isPiped; }
  // What to tell the process.
  const trace::TraceOrder& order() const { return forProcess; }

  // Passes on what has come, and waits for more for a tenth of a second at most. Returns false when nothing will come
  // any more: nothing passes through the tool or, once no other writer is expected, nobody writes to the pipe.
  bool passOn();
  void expectNoOtherWriter();
  // Whether what comes is thrown away, because it cannot be written. The process is not to wait for that.
  bool isBroken() const { return !trouble.empty(); }

  // Completes the files, and what a process left without its end; `cause` is why, if it did not come to its own end.
  // Throws std::runtime_error when the lines that passed through the tool could not all be written.
  void complete(const std::string& cause);

  const SummaryReport& report() const { return summary; }

 private:
  void checkFile() const;
  void checkPipe() const;
  void openPipe(int out);
  bool readPipe();
  void passLines(std::string_view lines);
  void nextPart();

  const RecordingArguments arguments;
  SummaryReport summary;
  trace::TraceOrder forProcess;

  bool isPiped = false;
  int readEnd = -1;
  int writeEnd = -1;
  std::unique_ptr<LineOutput> output;
  std::string rest;     // of a line that has not come whole
  std::string trouble;  // why lines cannot be written; empty: they can
  uint64_t calls = 0;
  bool hasHead = false;
  bool hasEnd = false;
  uint32_t lastNumber = 1;  // that a part's file has in its name
};

}  // namespace senseloom::tool
