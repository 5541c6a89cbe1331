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
  void found(uint32_t session) { sessions[session] = {"", "", false, false}; }
  void closed(uint32_t session) { sessions.erase(session); }
  void restarted(const std::vector<uint32_t>& restartedSessions);
  void dispatched(uint32_t session, std::string_view line, bool gaveResult);

  // Whether all that a session depends on is known.
  bool isWhole(uint32_t session) const;
  // The lines to repeat, those of a session only if they are all.
  std::vector<std::string> lines() const;

 private:
  struct Carried {
    std::string older = {};  // up to the last result
    std::string newer = {};  // since
    bool hasOlder = true;    // it was not too much to keep
    bool hasNewer = true;
  };
  std::unordered_map<uint32_t, Carried> sessions;
};

}  // namespace senseloom::trace
