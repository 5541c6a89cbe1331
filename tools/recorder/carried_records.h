#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace senseloom::trace {

// The records that the next part of a recording has to repeat, so that a replay of it alone goes on as the library did:
// for each session those since the last result but one, which are all that a batch, a count or a comparison with the
// last result can depend on. A session that starts over depends on none.
class CarriedRecords {
 public:
  // A session whose beginning is recorded.
  void opened(uint32_t session) { sessions[session] = {}; }
  // One that was open before the recording: what it holds is unknown.
  void found(uint32_t session) { sessions[session] = {.hasOlder = false, .hasNewer = false}; }
  void closed(uint32_t session) { sessions.erase(session); }
  void restarted(const std::vector<uint32_t>& restartedSessions);
  void dispatched(uint32_t session, std::string_view line, bool gaveResult);

  // Whether all that a session depends on is known.
  bool isWhole(uint32_t session) const;
  // The lines to repeat, those of a session only if they are all. They are in the order in which they were dispatched,
  // since the sessions of a sensor may share what they go by: the hand-drawn gesture found in the last record.
  std::vector<std::string> lines() const;

 private:
  struct Line {
    uint64_t number;  // of the dispatch
    std::string text;
  };
  struct Carried {
    std::vector<Line> older = {};  // up to the last result
    std::vector<Line> newer = {};  // since
    size_t newerSize = 0;          // bytes
    bool hasOlder = true;          // it was not too much to keep
    bool hasNewer = true;
  };
  uint64_t dispatches = 0;
  std::unordered_map<uint32_t, Carried> sessions;
};

}  // namespace senseloom::trace
