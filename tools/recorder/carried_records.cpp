#include "carried_records.h"

#include <map>
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
  ++dispatches;
  carried.newerSize += line.size();
  if (carried.newerSize > kMostKept) {
    carried.newer.clear();
    carried.hasNewer = false;
  } else {
    carried.newer.push_back({dispatches, std::string(line)});
  }
  if (!gaveResult) return;
  carried.older = std::exchange(carried.newer, {});
  carried.newerSize = 0;
  carried.hasOlder = std::exchange(carried.hasNewer, true);
}

bool CarriedRecords::isWhole(uint32_t session) const {
  const auto found = sessions.find(session);
  return found == sessions.end() || (found->second.hasOlder && found->second.hasNewer);
}

std::vector<std::string> CarriedRecords::lines() const {
  std::map<uint64_t, std::string> byNumber;
  for (const auto& [session, carried] : sessions) {
    if (!isWhole(session)) continue;
    for (const auto* lines : {&carried.older, &carried.newer}) {
      for (const Line& line : *lines) byNumber.emplace(line.number, line.text);
    }
  }
  std::vector<std::string> lines;
  for (auto& [number, text] : byNumber) lines.push_back(std::move(text));
  return lines;
}

}  // namespace senseloom::trace
