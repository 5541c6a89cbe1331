#pragma once

#include <cstddef>
#include <cstdio>
#include <deque>
#include <limits>
#include <map>
#include <string>
#include <vector>

#include "compare/call_difference.h"
#include "trace/call_filter.h"
#include "trace/recorded_calls.h"
#include "trace/trace_reader.h"

namespace senseloom::tool {

struct DiffArguments {
  std::string left;
  std::string right;
  FilterArguments filter = {};                       // which calls of each are compared
  size_t most = std::numeric_limits<size_t>::max();  // differing calls that are printed
  bool json = false;
};

// Compares two traces session by session: the first call of a session with its first call in the other, and so on. Of
// sessions that have the same name one after the other, the calls are taken together. Calls are matched as they are
// read, so that only those are kept which the other trace has not come to.
class TraceDiff {
 public:
  // Throws InputError when a file cannot be opened, and as CallFilter does.
  TraceDiff(std::FILE* stream, const DiffArguments& diffArguments);

  // Prints the differences. Throws std::runtime_error with their number if there are any, and InputError as
  // TraceReader does.
  void run();

 private:
  struct Side {
    Side(const std::string& file, const FilterArguments& filter) : reader(file), calls(filter, reader) {}
    TraceReader reader;
    RecordedCalls calls;
    bool isAtEnd = false;
  };
  struct Session {
    const Sensor* sensor = nullptr;
    std::deque<TraceCall> waiting[2];  // of each side; one of them is empty
    bool differs = false;
  };

  // Takes the next call of a side, and compares it if the other side has come to it.
  void step(size_t side);
  void compare(const std::string& name, Session& session, const TraceCall& left, const TraceCall& right);
  void tellAlone(const std::string& name, const TraceCall& call, size_t side);
  bool isPrinted();
  std::string where(const TraceCall& call, size_t side) const;

  std::FILE* out;
  const DiffArguments arguments;
  Side sides[2];
  std::map<std::string, Session> sessions;
  size_t compared = 0;
  size_t different = 0;
};

}  // namespace senseloom::tool
