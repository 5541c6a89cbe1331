#include "comparison.h"

#include <fake_platform.h>

#include <utility>

#include "held_lists.h"

namespace oracle {
namespace {

class Comparison {
 public:
  Comparison(Mistake mistake, Tallies* counts) : model(mistake), tallies(counts) {
    model.deviceAddress = fake::platform().deviceAddress();
  }
  ~Comparison() { client.restore(); }
  Comparison(const Comparison&) = delete;
  Comparison& operator=(const Comparison&) = delete;

  // What is different; empty when nothing is.
  std::string make(const Call& call);
  std::string closeAll();

 private:
  std::string make(const Call& call, void* handle);
  std::string stateDifference();
  void count(const Call& call, const Outcome& outcome);

  Client client;
  Model model;
  HeldLists held;
  Tallies* tallies;
};

std::string Comparison::make(const Call& call) {
  for (void* handle : client.targets(call)) {
    if (std::string text = make(call, handle); !text.empty()) return text;
  }
  return "";
}

std::string Comparison::make(const Call& call, void* handle) {
  Observation observation = client.make(call, handle);
  if (observation.opened != nullptr && model.isLive(observation.opened)) {
    observation.complaint += "the handle of an open session was given again; ";
  }
  const Outcome expected = makeOnModel(model, call, handle, observation.opened);
  std::string text = observation.complaint + difference(expected, observation.outcome);
  if (call.what == Call::close && call.misuse != Call::nullOut && !model.isLive(handle))
    client.noteClosed(call, handle);
  // A stale handle can have become that of a session on any sensor.
  if (call.misuse == Call::staleHandle) {
    ctx_option_release(observation.list);
  } else if (observation.list != nullptr) {
    held.take(client.sensorOf(call.session), observation, model);
  }
  if (tallies != nullptr && (handle != nullptr || call.what == Call::open)) count(call, expected);
  return text + stateDifference();
}

std::string Comparison::stateDifference() {
  std::string text;
  if ((device != nullptr) != model.deviceOpen()) text += "`device` is wrong; ";
  if (gIsActivated != model.active()) text += "`gIsActivated` is wrong; ";
  return text + held.difference(model);
}

std::string Comparison::closeAll() {
  Call call;
  call.what = Call::close;
  while (!client.openSessions().empty()) {
    call.session = client.openSessions().front();
    if (std::string text = make(call); !text.empty()) return text;
  }
  return "";
}

void Comparison::count(const Call& call, const Outcome& outcome) {
  if (call.misuse != Call::none) return;
  const bool hasSession = call.what == Call::setOption || call.what == Call::dispatch;
  Tally& tally = (*tallies)[static_cast<size_t>(hasSession ? client.sensorOf(call.session) : call.sensor)];
  switch (call.what) {
    case Call::open:
      ++(outcome.returned == 1 ? tally.opened : tally.notOpened);
      break;
    case Call::setOption:
      ++(outcome.list ? tally.lists : tally.refusedOptions);
      break;
    case Call::dispatch:
    case Call::dispatchToSensor:
      ++(outcome.returned == 1 ? tally.results : outcome.returned == 0 ? tally.nothings : tally.refusedRecords);
      break;
    default:
      break;
  }
}

}  // namespace

std::optional<Difference> compare(const Sequence& sequence, Mistake mistake, Tallies* tallies) {
  Comparison comparison(mistake, tallies);
  for (size_t i = 0; i < sequence.size(); ++i) {
    if (std::string text = comparison.make(sequence[i]); !text.empty()) return Difference{i, std::move(text)};
  }
  if (std::string text = comparison.closeAll(); !text.empty()) return Difference{sequence.size(), std::move(text)};
  return std::nullopt;
}

}  // namespace oracle
