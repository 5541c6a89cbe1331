#include "trace/record_joiner.h"

#include <algorithm>

namespace senseloom::tool {

bool RecordJoiner::isNew(const CallOutcome& dispatch) {
  const bool isSame = !sessions.empty() && sensor == dispatch.sensor && std::ranges::equal(bytes, dispatch.record) &&
                      std::ranges::find(sessions, dispatch.session) == sessions.end();
  if (!isSame) {
    sensor = dispatch.sensor;
    bytes.assign(dispatch.record.begin(), dispatch.record.end());
    sessions.clear();
  }
  sessions.push_back(dispatch.session);
  return !isSame;
}

}  // namespace senseloom::tool
