#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "kinds/sensor_table.h"
#include "trace/engine_answer.h"
#include "trace/json.h"
#include "trace/trace_form.h"

namespace senseloom::tool {

// One call of a trace.
struct TraceCall {
  size_t line = 0;
  CallKind kind = CallKind::uninit;
  std::string session;                    // empty for uninit, and for a dispatch to a whole sensor
  const Sensor* sensor = nullptr;         // of an open, and of a dispatch to a whole sensor
  std::optional<std::string> option;      // of a set_option; nothing: a null pointer
  Json record;                            // of a dispatch
  std::optional<int64_t> atMicroseconds;  // since the recording began
  bool isResumed = false;                 // an open: the session was open before the recording
  Json recorded;                          // what a recording says of its outcome; null: nothing
  int64_t list = 0;                       // the number of the property list that it gave; 0: none, or it is not told
  Json truth;                             // of a dispatch: the member of that name, whatever it is; null: there is none
  // Of a dispatch: what the gesture engine answered; nothing: it was not asked, or nobody knows.
  std::optional<std::vector<EngineAnswer>> engine;
};

// Whether a line's object is a note for readers, with no call.
bool isNote(const Json& object);
// What a note says, with its reason.
std::string noteText(const Json& note);

// Whether a line's object is the release of a property list.
bool isRelease(const Json& object);
// The number of the list that is released; 0: none that a call gave; nothing: NULL. Throws InputError if it names none.
std::optional<int64_t> releasedList(const Json& release);

// The call of a line's object. Members beyond those of the call are ignored. Throws InputError if it has none.
TraceCall readCall(const Json& object);

}  // namespace senseloom::tool
