#include "in_force.h"

#include <algorithm>
#include <utility>

#include "trace/trace_form.h"
#include "trace/trace_line.h"

namespace senseloom::trace {

using tool::CallKind;
using tool::callName;
using tool::TraceLine;
namespace member = tool::member;

namespace {

// Enough for every string that says something new; a session that is given more than that says the same in other words.
constexpr size_t kMostOptions = 256;

TraceLine lineOf(CallKind call, const std::string& session) {
  TraceLine line;
  line.addText(member::kCall, callName(call));
  line.addText(member::kSession, session);
  return line;
}

}  // namespace

std::string sessionName(uint32_t number) {
  return 's' + std::to_string(number);
}

void InForce::opened(uint32_t session, const char* sensor) {
  const auto place = events.insert(events.end(), Event{Kind::open, session, "", false, 0});
  sessions[session] = {.sensor = sensor, .opening = place, .options = {}};
  lastOpened = session;
}

void InForce::optionSet(uint32_t session, const char* option, bool wasAccepted) {
  const auto found = sessions.find(session);
  if (found == sessions.end()) return;
  auto& options = found->second.options;
  auto old = std::find_if(options.begin(), options.end(), [&](const EventPlace& place) {
    return place->text == option && place->wasAccepted == wasAccepted;
  });
  if (old == options.end() && options.size() == kMostOptions) old = options.begin();
  if (old != options.end()) {
    events.erase(*old);
    options.erase(old);
  }
  options.push_back(events.insert(events.end(), Event{Kind::option, session, option, wasAccepted, 0}));
  if (wasAccepted) forgetRenegotiation(found->second.sensor);
}

void InForce::closed(uint32_t session, bool othersRemain) {
  const auto found = sessions.find(session);
  if (found == sessions.end()) return;
  const OpenSession closing = std::move(found->second);
  sessions.erase(found);
  events.erase(closing.opening);
  for (const EventPlace& option : closing.options) events.erase(option);
  forgetRenegotiation(closing.sensor);
  if (othersRemain && isAnyOpen(closing.sensor)) {
    renegotiations[closing.sensor] =
        events.insert(events.end(), Event{Kind::renegotiation, 0, closing.sensor, false, 0});
  }
  // An uninit matters for sessions that were open then.
  events.remove_if([this](const Event& event) {
    return event.kind == Kind::uninit && (sessions.empty() || sessions.begin()->first > event.openUntil);
  });
}

void InForce::uninitialised() {
  lists.clear();
  if (!sessions.empty()) events.push_back({Kind::uninit, 0, "", false, lastOpened});
}

void InForce::listed(uint32_t session, std::string note) {
  lists[sensorOf(session)] = std::move(note);
}

std::vector<uint32_t> InForce::sessionsBeside(uint32_t session) const {
  const std::string sensor = sensorOf(session);
  std::vector<uint32_t> beside;
  for (const auto& [number, open] : sessions) {
    if (open.sensor == sensor) beside.push_back(number);
  }
  return beside;
}

std::string InForce::sensorOf(uint32_t session) const {
  const auto found = sessions.find(session);
  return found == sessions.end() ? "" : found->second.sensor;
}

void InForce::tell(const Tell& tellLine, const std::function<bool(uint32_t)>& isResumed) const {
  for (const Event& event : events) {
    if (event.kind == Kind::renegotiation) {
      tellRenegotiation(tellLine, event.text);
      continue;
    }
    TraceLine line;
    if (event.kind == Kind::uninit) {
      line.addText(member::kCall, callName(CallKind::uninit));
    } else if (event.kind == Kind::open) {
      line = lineOf(CallKind::open, sessionName(event.session));
      line.addText(member::kSensor, sensorOf(event.session));
      if (isResumed(event.session)) line.addInteger(member::kResumed, 1);
    } else {
      line = lineOf(CallKind::setOption, sessionName(event.session));
      line.addText(member::kOption, event.text);
      if (!event.wasAccepted) line.addInteger(member::kRefused, 1);
    }
    tellLine(line.finish(), true);
  }
  for (const auto& [sensor, note] : lists) {
    if (isAnyOpen(sensor)) tellLine(note, false);
  }
}

// A session that comes and goes has the others negotiate, as the one that was closed did.
void InForce::tellRenegotiation(const Tell& tellLine, const std::string& sensor) const {
  TraceLine line = lineOf(CallKind::open, sessionName(0));
  line.addText(member::kSensor, sensor);
  tellLine(line.finish(), true);
  line = lineOf(CallKind::close, sessionName(0));
  tellLine(line.finish(), true);
}

void InForce::forgetRenegotiation(const std::string& sensor) {
  const auto found = renegotiations.find(sensor);
  if (found == renegotiations.end()) return;
  events.erase(found->second);
  renegotiations.erase(found);
}

bool InForce::isAnyOpen(const std::string& sensor) const {
  return std::any_of(sessions.begin(), sessions.end(), [&](auto& session) { return session.second.sensor == sensor; });
}

}  // namespace senseloom::trace
