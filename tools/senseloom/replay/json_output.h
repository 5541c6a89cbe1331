#pragma once

#include <cstdio>

#include "trace/replayer.h"

namespace senseloom::tool {

// Prints one JSON object per call and session. Which members it has depends on the call alone, not on its outcome:
//
//   "line"        line of the trace; null: closing a session that the trace left open
//   "call"        as in the trace
//   "session"     its name (not for uninit)
//   "sensor"      its sensor's name (not for uninit)
//   "return"      what the library returned; for an open "handle" or null (not for uninit)
//   "option"      for set_option: the text, or null
//   "record"      for dispatch: the fields of the record; null when its bytes are not such a record
//   "recordHex"   for dispatch: the bytes of the record
//   "properties"  for set_option and close: an array of {"id","name","value"}, with "hex" in place of "value" for the
//                 bytes of a gesture template; null when the library handed out no list
//   "result"      for dispatch: the fields of the result; null when there is none, or its bytes are not such a record
//   "hex"         for dispatch: the bytes of the result; null when there is none
//
// A note of the trace is an object with "line" and "note".
class JsonOutput final : public ReplayObserver {
 public:
  explicit JsonOutput(std::FILE* stream) : out(stream) {}
  void onOutcome(const CallOutcome& outcome) override;
  void onNote(size_t line, const std::string& text) override;

 private:
  std::FILE* out;
};

}  // namespace senseloom::tool
