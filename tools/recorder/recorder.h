#pragma once

#include <cstdint>
#include <unordered_map>

#include "senseloom.h"
#include "trace/trace_form.h"
#include "trace/trace_line.h"
#include "trace_file.h"

namespace senseloom::trace {

// Writes calls of the library to the trace, one line each, when they have returned. Each call is recorded in two steps:
// its arguments before it is made, since they may be in memory that it changes, and then what it returned.
//
// Sessions are named s1, s2 and so on, in the order of the calls that opened them. What a trace cannot express (an
// argument that is NULL, a handle that is not open, a sensor that does not exist) is written as a note, for readers
// only: the library refuses such calls and changes nothing, so a replay has the same outcome without them.
//
// Recording never makes a call fail: a line for which there is not enough memory counts as lost.
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
  bool hasResult = false;  // whether the arguments of that call give the result a place to go
  uint32_t sessions = 0;   // opened so far
  std::unordered_map<const void*, uint32_t> numbers;
};

}  // namespace senseloom::trace
