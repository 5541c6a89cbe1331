#include "model.h"

#include <algorithm>
#include <string_view>
#include <utility>

#include "option_reading.h"

namespace senseloom::model {

Outcome Model::open(const char* name, const void* handle) {
  if (!prepare() || name == nullptr) return std::exchange(outcome, {});
  const int kind = kindNamed(std::string_view(name).substr(0, 9));
  if (kind < 0 || shortage.room) return std::exchange(outcome, {});
  Sensor& sensor = sensors[static_cast<size_t>(kind)];
  if (sensor.queue.empty() && kind == lpe && !audio.activate(answers, deviceAddress, outcome)) {
    return std::exchange(outcome, {});
  }
  if (shortage.session) return std::exchange(outcome, {});

  if (kind == gspx) gestures.sessionOpened(answers, outcome);
  sessions.push_back({.handle = handle, .request = Request(kind), .activity = {}, .gathering = {}});
  if (kind == phyac) sessions.back().activity = Activity(mistake);
  sensor.queue.push_back(handle);
  outcome.returned = 1;
  return std::exchange(outcome, {});
}

Outcome Model::setOption(const void* handle, const char* text, bool hasOut) {
  outcome.returned = -1;
  if (text == nullptr && explains) outcome.why.remarks.push_back(nullText());
  if (text == nullptr || handle == nullptr || !hasOut) return std::exchange(outcome, {});
  outcome.storesList = true;
  if (!prepare()) return std::exchange(outcome, {});
  Session* found = session(handle);
  if (found == nullptr) return std::exchange(outcome, {});
  if (shortage.room) return std::exchange(outcome, {});
  const ReadingPlace place{templates, outcome.log, explains ? &outcome.why.remarks : nullptr};
  if (!readOption(found->request, text, !shortage.text, place)) return std::exchange(outcome, {});
  if (mistake == Mistake::optionDropsPendingItems) found->gathering.drop();
  if (shortage.copy) return std::exchange(outcome, {});
  negotiate(Merged(found->request), *found);
  if (outcome.list && rebuild(found->kind())) outcome.returned = 0;
  return std::exchange(outcome, {});
}

Outcome Model::close(const void* handle, bool hasOut) {
  outcome.returned = -1;
  if (!hasOut || handle == nullptr) return std::exchange(outcome, {});
  outcome.storesList = true;
  if (!prepare()) return std::exchange(outcome, {});
  const Session* found = session(handle);
  if (found == nullptr) return std::exchange(outcome, {});
  const auto& queue = sensorOf(*found).queue;
  const auto first = std::find_if(queue.begin(), queue.end(), [&](auto* other) { return other != handle; });
  const void* remaining = first == queue.end() ? nullptr : *first;
  if (remaining != nullptr && shortage.copy) return std::exchange(outcome, {});

  const Request closed = found->request;
  remove(*found);
  if (remaining == nullptr) {
    outcome.returned = stop(closed.kind()) ? 0 : -1;
    return std::exchange(outcome, {});
  }
  const Session& starter = *session(remaining);
  Merged merged(starter.request);
  if (mistake == Mistake::closedSessionStaysMerged) merged.merge(closed);
  negotiate(std::move(merged), starter);
  if (rebuild(closed.kind())) outcome.returned = 1;
  return std::exchange(outcome, {});
}

Outcome Model::dispatch(const void* handle, const uint8_t* data, int len, bool hasOut, bool hasLength) {
  outcome.returned = -1;
  if (data == nullptr || handle == nullptr || len < 0 || !hasLength || !hasOut) return std::exchange(outcome, {});
  if (!prepare()) return std::exchange(outcome, {});
  if (Session* found = session(handle)) {
    outcome.why.verdict = judge(*found, Record(data, static_cast<size_t>(len)));
    outcome.returned = outcome.why.verdict.returned();
  }
  return std::exchange(outcome, {});
}

Outcome Model::uninit() {
  if (!inited) return {};
  inited = false;
  for (Sensor& sensor : sensors) sensor = {.queue = {}, .leastLogM = 0, .negotiations = sensor.negotiations + 1};
  return {};
}

// The pointers of deleted sensors are found, too.
Outcome Model::find(const char* name) {
  outcome.returned = name != nullptr && kindNamed(name) >= 0 ? 1 : 0;
  return std::exchange(outcome, {});
}

Outcome Model::audioInit() {
  outcome.returned = audio.open(answers, outcome) ? 1 : 0;
  return std::exchange(outcome, {});
}

Outcome Model::audioActivate() {
  outcome.returned = audio.activate(answers, deviceAddress, outcome) ? 1 : 0;
  return std::exchange(outcome, {});
}

Outcome Model::audioDeactivate() {
  outcome.returned = audio.deactivate(answers, outcome) ? 1 : 0;
  return std::exchange(outcome, {});
}

bool Model::isLive(const void* handle) const {
  return session(handle) != nullptr;
}

std::string Model::chain(const void* handle) const {
  const Session* found = session(handle);
  return found == nullptr || !found->activity ? "" : found->activity->chain();
}

const Model::Session* Model::session(const void* handle) const {
  const auto found = std::find_if(sessions.begin(), sessions.end(), [&](auto& one) { return one.handle == handle; });
  return found == sessions.end() ? nullptr : &*found;
}

Model::Session* Model::session(const void* handle) {
  return const_cast<Session*>(std::as_const(*this).session(handle));
}

bool Model::prepare() {
  if (!inited && shortage.room) return false;
  inited = true;
  return true;
}

void Model::negotiate(Merged merged, const Session& first) {
  Sensor& sensor = sensorOf(first);
  for (size_t i = 0; i < sensor.queue.size(); ++i) {
    write(outcome.log, kInfo, "Libsl", "The %d of %d session of sensor %s has %p option!\n", static_cast<int>(i),
          static_cast<int>(sensor.queue.size()), rowOf(first.kind()).sensor, sensor.queue[i]);
    merged.merge(session(sensor.queue[i])->request);
  }
  if (first.kind() == phyac) sensor.leastLogM = merged.value("logM");
  ++sensor.negotiations;
  std::optional<Remark> conflict;
  outcome.list = merged.render(templates, outcome.log, conflict);
  if (shortage.list) outcome.list.reset();
  if (explains) explainNegotiation(merged, first, std::move(conflict));
}

void Model::explainNegotiation(const Merged& merged, const Session& first, std::optional<Remark> conflict) {
  const auto& queue = sensorOf(first).queue;
  const auto isMerged = [&](const Session& one) {
    return std::find(queue.begin(), queue.end(), one.handle) != queue.end();
  };
  Negotiation& negotiation = outcome.why.negotiation.emplace();
  size_t firstIndex = 0;
  for (const Session& one : sessions) {
    if (&one == &first) firstIndex = negotiation.participants.size();
    if (&one == &first || isMerged(one)) negotiation.participants.push_back({one.handle, one.request});
  }
  negotiation.keys = decidedKeys(negotiation.participants, firstIndex, isMerged(first), merged);
  negotiation.conflict = std::move(conflict);
}

// Only activity sessions have anything to rebuild.
bool Model::rebuild(int kind) {
  if (kind != phyac) return true;
  const Sensor& sensor = sensors[phyac];
  bool all = true;
  for (size_t i = 0; i < sensor.queue.size(); ++i) {
    if (bit(static_cast<int32_t>(shortage.rebuild), static_cast<int64_t>(i))) {
      all = false;
      continue;
    }
    Session& one = *session(sensor.queue[i]);
    const size_t cutOff = one.activity->restart(one.request, sensor.leastLogM);
    if (!outcome.why.negotiation) continue;
    for (Participant& participant : outcome.why.negotiation->participants) {
      if (participant.handle != one.handle) continue;
      participant.chain = one.activity->chain();
      participant.cutOff = cutOff;
    }
  }
  return all;
}

Verdict Model::judge(Session& session, Record record) {
  switch (rowOf(session.kind()).judging) {
    case Judging::activity:
      return session.activity->judge(record, outcome);
    case Judging::gestures:
      return gestures.judge(session.request.value("classMask"), record, answers, outcome);
    case Judging::gathering:
      return session.gathering.judge(session.request, record, outcome);
    default:
      return judgeAlone(session.request, record, outcome);
  }
}

bool Model::stop(int kind) {
  return kind != lpe || audio.deactivate(answers, outcome);
}

void Model::remove(const Session& session) {
  if (session.kind() == gspx) gestures.sessionClosed(outcome);
  if (session.activity) outcome.why.items.cutOff = session.activity->pending();
  outcome.why.items.gathered = session.gathering.pending();
  std::erase(sensorOf(session).queue, session.handle);
  sessions.erase(sessions.begin() + (&session - sessions.data()));
}

}  // namespace senseloom::model
