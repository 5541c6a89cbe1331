#pragma once

#include <cstdint>
#include <unordered_map>

#include "senseloom.h"
#include "trace/trace_form.h"
#include "trace/trace_line.h"
#include "trace_file.h"

namespace senseloom::trace {

// Writes calls of the library to the trace, each when it has returned, as one line. A call comes in two steps: its
// arguments before it is made, since they may be memory that it changes, then what it returned.
//
// Sessions are called s1, s2 and so on, in the order of the calls that opened them. What a trace can not say (an
// argument that is NULL, a handle that is not open, a sensor that does not exist) is written as a note, for readers
// only: the library refuses such calls and changes nothing, so a replay comes out the same without them.
//
// Nothing here fails the caller: a line that can not be put together for want of memory counts as lost.
class Recorder {
 public:
  void opened(const char* sensor, bool exists, void* handle) noexcept;

  void beforeSetOption(void* handle, const char* option, ctx_option_t** out) noexcept;
  void beforeDispatch(void* handle, const void* data, int len, void** out, const int* outlen) noexcept;
  void beforeClose(void* handle, ctx_option_t** out) noexcept;

  void negotiated(int returned, ctx_option_t** out) noexcept;
  void dispatched(int returned, void** out, const int* outlen) noexcept;
  // The session is gone, whatever was returned.
  void closed(void* handle, int returned, ctx_option_t** out) noexcept;

  void uninitialised() noexcept;
  void atExit() const noexcept { file.reportLost(); }

 private:
  template <class Step>
  void attempt(Step step) noexcept;
  bool begin(tool::CallKind call, void* handle, bool hasArguments);
  void end();

  TraceFile file;
  tool::TraceLine line;    // the call that is being made; empty when it is not to be written
  bool hasResult = false;  // ... and whether the library looks at where its result is to go
  uint32_t sessions = 0;   // that were ever opened
  std::unordered_map<const void*, uint32_t> numbers;
};

}  // namespace senseloom::trace
