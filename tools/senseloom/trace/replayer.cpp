#include "trace/replayer.h"

#include <algorithm>
#include <utility>

#include "input_error.h"
#include "trace/record_codec.h"
#include "trace/record_field.h"
#include "trace/recorded_engine.h"

namespace senseloom::tool {
namespace {

// Copies a property list at once, since the next call makes its values stale.
std::optional<PropertyList> copyOf(const senseloom::PropertyList& list, const Sensor& sensor) {
  if (!list) return std::nullopt;
  PropertyList properties;
  for (const auto property : list) {
    properties.push_back({.id = property.id(),
                          .value = {property.bytes().begin(), property.bytes().end()},
                          .isBytes = property.id() == sensor.bytesProperty});
  }
  return properties;
}

int returnedBy(DispatchOutcome outcome) {
  switch (outcome) {
    case DispatchOutcome::delivered:
      return 1;
    case DispatchOutcome::nothing:
      return 0;
    case DispatchOutcome::refused:
      break;
  }
  return -1;
}

int returnedBy(CloseOutcome outcome) {
  switch (outcome) {
    case CloseOutcome::sessionsRemain:
      return 1;
    case CloseOutcome::sensorStopped:
      return 0;
    case CloseOutcome::failed:
      break;
  }
  return -1;
}

}  // namespace

std::optional<int32_t> Property::integer() const {
  if (isBytes || value.size() != sizeof(int32_t)) return std::nullopt;
  return recordField<int32_t>(value, 0);
}

void Replayer::replay(TraceReader& trace) {
  trace.listen([this](size_t line, const Json& aside) {
    if (isNote(aside)) observer.onNote(line, noteText(aside));
  });
  try {
    while (const auto call = trace.next()) perform(*call);
  } catch (const InputError& error) {
    throw InputError(trace.position() + ": " + error.what());
  }
  // A session that never opened has nothing to close.
  std::erase_if(clients, [](const Client& client) { return !client.session; });
  TraceCall closing;
  closing.kind = CallKind::close;
  while (!clients.empty()) close(closing, clients.begin());
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
    case CallKind::dispatch: {
      const RecordedEngine engine(call.engine);
      if (call.sensor != nullptr) {
        dispatchToSensor(call);
      } else {
        Client& client = *require(call.session);
        dispatch(call, client, encodeRecord(*client.sensor, call.record.get()));
      }
      break;
    }
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
  if (known != clients.end()) {
    if (known->session) throw InputError("session \"" + call.session + "\" is already open");
    clients.erase(known);
  }
  clients.push_back({call.session, call.sensor, Session::open(call.sensor->name)});
  observer.onOutcome({.call = call, .session = call.session, .sensor = call.sensor, .failed = !clients.back().session});
}

void Replayer::setOption(const TraceCall& call, Client& client) {
  const OptionResult result = client.session.setOption(call.option ? call.option->c_str() : nullptr);
  observer.onOutcome({.call = call,
                      .session = client.name,
                      .sensor = client.sensor,
                      .failed = !result.accepted,
                      .returned = result.accepted ? 0 : -1,
                      .properties = copyOf(result.properties, *client.sensor)});
}

void Replayer::dispatch(const TraceCall& call, Client& client, std::span<const uint8_t> record) {
  const DispatchResult dispatched = client.session.dispatch(record);
  CallOutcome outcome{.call = call,
                      .session = client.name,
                      .sensor = client.sensor,
                      .failed = dispatched.outcome == DispatchOutcome::refused,
                      .returned = returnedBy(dispatched.outcome)};
  if (dispatched.outcome == DispatchOutcome::delivered) outcome.result = dispatched.result;
  outcome.record = record;
  observer.onOutcome(outcome);
}

void Replayer::dispatchToSensor(const TraceCall& call) {
  const auto record = encodeRecord(*call.sensor, call.record.get());
  for (Client& client : clients) {
    if (client.sensor == call.sensor && client.session) dispatch(call, client, record);
  }
}

void Replayer::close(const TraceCall& call, ClientIterator client) {
  // The session is gone whatever the library returns.
  Client closing = std::move(*client);
  clients.erase(client);
  const CloseResult result = closing.session.close();
  observer.onOutcome({.call = call,
                      .session = closing.name,
                      .sensor = closing.sensor,
                      .failed = result.outcome == CloseOutcome::failed,
                      .returned = returnedBy(result.outcome),
                      .properties = copyOf(result.properties, *closing.sensor)});
}

Replayer::ClientIterator Replayer::find(const std::string& name) {
  return std::find_if(clients.begin(), clients.end(), [&name](const Client& client) { return client.name == name; });
}

Replayer::ClientIterator Replayer::require(const std::string& name) {
  const auto client = find(name);
  if (client == clients.end()) throw InputError("no session \"" + name + "\" is open");
  return client;
}

}  // namespace senseloom::tool
