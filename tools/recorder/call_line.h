#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

#include "contract_watch.h"
#include "senseloom.h"
#include "trace/trace_form.h"
#include "trace/trace_line.h"
#include "trace_order.h"

// The lines of a recording that are not repeated ones.
namespace senseloom::trace {

// When a call was made, and by whom.
struct CallTime {
  int64_t at;    // nanoseconds since the recording began
  int64_t took;  // nanoseconds
  int thread;
};

// The head of a part; `startedAt` is the wall-clock time when the recording began, in nanoseconds since 1970.
std::string headLine(uint32_t part, int64_t startedAt);
std::string breachLine(const Breach& breach, int64_t at);
// `number` is that of the list; 0: NULL, or one that no call gave.
std::string releaseLine(const void* list, int64_t number, int64_t at, int thread);
// For readers: what list a sensor has.
std::string listNote(const std::string& sensor, const ctx_option_t& list);

void addProperties(tool::TraceLine& line, const ctx_option_t& list);
void addTime(tool::TraceLine& line, const CallTime& time);

}  // namespace senseloom::trace
