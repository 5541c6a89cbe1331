#include "carried_records.h"

#include <utility>

namespace senseloom::trace {
namespace {

constexpr size_t kMostKept = 64 << 10;  // bytes of a session since its last result

}  // namespace

void CarriedRecords::restarted(const std::vector<uint32_t>& restartedSessions) {
  for (const uint32_t session : restartedSessions) sessions[session] = {};
}

void CarriedRecords::dispatched(uint32_t session, std::string_view line, bool gaveResult) {
  Carried& carried = sessions[session];
  if (carried.newer.size() + line.size() > kMostKept) {
    carried.newer.clear();
    carried.hasNewer = false;
  } else if (carried.hasNewer) {
    carried.newer += line;
  }
  if (!gaveResult) return;
  carried.older = std::exchange(carried.newer, "");
  carried.hasOlder = std::exchange(carried.hasNewer, true);
}

bool CarriedRecords::isWhole(uint32_t session) const {
  const auto found = sessions.find(session);
  return found == sessions.end() || (found->second.hasOlder && found->second.hasNewer);
}

std::vector<std::string> CarriedRecords::lines() const {
  std::vector<std::string> lines;
  for (const auto& [session, carried] : sessions) {
    if (!isWhole(session)) continue;
    const std::string all = carried.older + carried.newer;
    for (size_t start = 0; start < all.size();) {
      const size_t end = all.find('\n', start) + 1;
      lines.push_back(all.substr(start, end - start));
      start = end;
    }
  }
  return lines;
}

}  // namespace senseloom::trace
