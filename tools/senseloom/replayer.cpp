#include "replayer.h"

#include <algorithm>
#include <cstring>
#include <memory>
#include <utility>

#include "input_error.h"

namespace senseloom::tool {
namespace {

constexpr int32_t kTemplateBytes = 123;

struct ListRelease {
  void operator()(ctx_option_t* list) const { ctx_option_release(list); }
};

// Copies a property list at once, since the next call makes its values stale, and releases it.
std::optional<PropertyList> takeProperties(ctx_option_t* list) {
  const std::unique_ptr<ctx_option_t, ListRelease> owner(list);
  if (list == nullptr) return std::nullopt;
  PropertyList properties;
  for (int32_t i = 0; i < list->count; ++i) {
    const ctx_property_t& property = list->properties[i];
    const auto* value = static_cast<const uint8_t*>(property.value);
    properties.push_back({property.id, {value, value + property.size}});
  }
  return properties;
}

}  // namespace

std::optional<int32_t> Property::integer() const {
  int32_t number;
  if (id == kTemplateBytes || value.size() != sizeof number) return std::nullopt;
  std::memcpy(&number, value.data(), sizeof number);
  return number;
}

Replayer::~Replayer() {
  for (const Session& session : sessions) {
    ctx_option_t* list = nullptr;
    ctx_close_session(session.handle, &list);
    ctx_option_release(list);
  }
}

void Replayer::replay(TraceReader& trace) {
  try {
    while (const auto call = trace.next()) perform(*call);
  } catch (const InputError& error) {
    throw InputError(trace.position() + ": " + error.what());
  }
  // A session that never opened has nothing to close.
  std::erase_if(sessions, [](const Session& session) { return session.handle == nullptr; });
  TraceCall closing;
  closing.kind = CallKind::close;
  while (!sessions.empty()) close(closing, sessions.begin());
  observer.onEnd();
}

void Replayer::perform(const TraceCall& call) {
  switch (call.kind) {
    case CallKind::open:
      open(call);
      break;
    case CallKind::setOption:
      setOption(call, *require(call.session));
      break;
    case CallKind::dispatch:
      if (call.sensor != nullptr) {
        dispatchToSensor(call);
      } else {
        const Session& session = *require(call.session);
        auto record = encodeRecord(*session.sensor, call.record.get());
        dispatch(call, session, record);
      }
      break;
    case CallKind::close:
      close(call, require(call.session));
      break;
    case CallKind::uninit:
      ctx_uninit();
      observer.onOutcome({.call = call, .session = call.session});
      break;
  }
}

void Replayer::open(const TraceCall& call) {
  const auto known = find(call.session);
  if (known != sessions.end()) {
    if (known->handle != nullptr) throw InputError("session \"" + call.session + "\" is already open");
    sessions.erase(known);
  }
  void* handle = ctx_open_session(call.sensor->sensor);
  sessions.push_back({call.session, call.sensor, handle});
  observer.onOutcome({.call = call, .session = call.session, .sensor = call.sensor, .failed = handle == nullptr});
}

void Replayer::setOption(const TraceCall& call, const Session& session) {
  ctx_option_t* list = nullptr;
  const int returned = ctx_set_option(session.handle, 0, call.option ? call.option->c_str() : nullptr, &list);
  observer.onOutcome({.call = call,
                      .session = session.name,
                      .sensor = session.sensor,
                      .failed = returned < 0,
                      .returned = returned,
                      .properties = takeProperties(list)});
}

void Replayer::dispatch(const TraceCall& call, const Session& session, std::span<uint8_t> record) {
  // The library takes a record of no bytes, but no null pointer.
  uint8_t nothing = 0;
  void* data = record.empty() ? &nothing : record.data();
  void* result = nullptr;
  int length = 0;
  const int returned = ctx_dispatch_data(session.handle, data, static_cast<int>(record.size()), &result, &length);
  CallOutcome outcome{
      .call = call, .session = session.name, .sensor = session.sensor, .failed = returned < 0, .returned = returned};
  if (returned == 1) outcome.result.emplace(static_cast<const uint8_t*>(result), static_cast<size_t>(length));
  outcome.record = record;
  observer.onOutcome(outcome);
}

void Replayer::dispatchToSensor(const TraceCall& call) {
  auto record = encodeRecord(*call.sensor, call.record.get());
  for (const Session& session : sessions) {
    if (session.sensor == call.sensor && session.handle != nullptr) dispatch(call, session, record);
  }
}

void Replayer::close(const TraceCall& call, SessionIterator session) {
  // The session is gone whatever the library returns.
  const Session closing = *session;
  sessions.erase(session);
  ctx_option_t* list = nullptr;
  const int returned = ctx_close_session(closing.handle, &list);
  observer.onOutcome({.call = call,
                      .session = closing.name,
                      .sensor = closing.sensor,
                      .failed = returned < 0,
                      .returned = returned,
                      .properties = takeProperties(list)});
}

Replayer::SessionIterator Replayer::find(const std::string& name) {
  return std::find_if(sessions.begin(), sessions.end(),
                      [&name](const Session& session) { return session.name == name; });
}

Replayer::SessionIterator Replayer::require(const std::string& name) {
  const auto session = find(name);
  if (session == sessions.end()) throw InputError("no session \"" + name + "\" is open");
  return session;
}

}  // namespace senseloom::tool
