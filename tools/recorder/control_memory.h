#pragma once

#include <atomic>
#include <cstddef>
#include <cstdint>

// Memory of each process that has the recording library, which others can look into and write orders to: a file without
// a name, found in /proc/PID/fd under the name below, which only the owner of the process and root can open. It never
// shrinks, so that nobody can take it away from the process. The layout is the same in both word sizes.
namespace senseloom::trace {

inline constexpr char kControlName[] = "senseloom-control";

// What became of a session's records since it was opened. Both numbers wrap around.
struct SessionCounts {
  std::atomic<uint32_t> session;  // its number; 0: nobody's
  std::atomic<uint32_t> records;
  std::atomic<uint32_t> results;
};

struct ControlMemory {
  static constexpr uint32_t kFormat = 1;
  static constexpr size_t kSessions = 1024;

  // One line, ended by a line feed: "off", or "record " and what trace_order.h reads. The process looks at the first
  // four bytes with each call, and obeys when they have changed and the line is complete. It puts its answer in the
  // place of the order: "ok: ..." or "no: ...". Writers other than the process write the first four bytes last.
  alignas(4) char order[4096];

  uint32_t format;
  uint32_t isRecording;
  // What is in force: lines as in a trace, one for each call that changed it, and for each sensor a note with its last
  // property list. They begin at kStateStart. Now and then the process makes them anew, shorter: the version is
  // odd meanwhile.
  std::atomic<uint32_t> version;
  std::atomic<uint32_t> stateSize;  // bytes

  SessionCounts counts[kSessions];  // sessions beyond are not counted here
};
// Where what is in force begins.
inline constexpr size_t kStateStart = (sizeof(ControlMemory) + 4095) / 4096 * 4096;
static_assert(sizeof(ControlMemory) == 4096 + 16 + 12 * ControlMemory::kSessions);

}  // namespace senseloom::trace
