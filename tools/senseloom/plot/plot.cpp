#include "plot/plot.h"

#include <algorithm>
#include <utility>

#include "kinds/option_data.h"
#include "plot/svg_text.h"
#include "trace/json.h"
#include "trace/record_field.h"

namespace senseloom::tool {
namespace {

constexpr size_t kMostClients = 24;
constexpr size_t kMostCharacters = 96;

bool isKnown(const char* sensor, const std::string& key) {
  const OptionDescription& kind = *findOptionDescription(sensor);
  return std::ranges::any_of(kind.keys, [&key](const auto& known) { return key == known.name; }) ||
         std::ranges::find(kind.stringKeys, key) != kind.stringKeys.end();
}

// An option in few words: its members, or the text as it stands.
std::string optionText(const char* sensor, const std::optional<std::string>& option) {
  if (!option) return "a null pointer";
  const Json root(json_loads(option->c_str(), 0, nullptr));
  std::string text;
  const char* key;
  json_t* value;
  json_object_foreach(root.get(), key, value) {
    if (!text.empty()) text += ", ";
    text.append(key).append(" ").append(json_is_integer(value) ? std::to_string(json_integer_value(value)) : "...");
    if (!isKnown(sensor, key)) text += " (unknown key)";
  }
  if (text.empty()) text = root == nullptr ? *option : "{}";
  return shortened(text, kMostCharacters);
}

}  // namespace

void Plot::onOutcome(const CallOutcome& outcome) {
  if (outcome.call.kind != CallKind::dispatch) joiner.end();
  if (outcome.sensor == nullptr) return;
  Group& group = groupOf(*outcome.sensor);
  PlotLane* client = clientOf(group, outcome.session);
  const size_t now = timeline.nextBin();
  switch (outcome.call.kind) {
    case CallKind::dispatch:
      dispatch(outcome, group, client);
      break;
    case CallKind::open:
      if (client != nullptr && !outcome.failed) client->at(now).presence = PlotLane::Presence::opens;
      break;
    case CallKind::setOption:
      if (!outcome.failed) group.records.at(now).negotiates = true;
      if (client != nullptr) setOption(outcome, *client);
      break;
    case CallKind::close:
      // What is closed after the end of the trace was open to the end.
      if (outcome.call.line == 0) break;
      if (outcome.returned == 1) group.records.at(now).negotiates = true;
      if (client != nullptr) client->at(now).presence = PlotLane::Presence::closes;
      break;
    case CallKind::uninit:
      break;
  }
}

void Plot::dispatch(const CallOutcome& outcome, Group& group, PlotLane* client) {
  const Sensor& sensor = *outcome.sensor;
  if (joiner.isNew(outcome)) {
    timestamp = recordField<uint64_t>(outcome.record, kTimestampOffset).value_or(timestamp);
    if (timeline.add(timestamp)) {
      for (Group& each : groups) {
        each.records.fold();
        for (PlotLane& lane : each.clients) lane.fold();
      }
    }
    group.records.receive(timeline.bin(), huesOf(sensor, outcome.record, false));
    ++group.records.offered;
  }
  if (client == nullptr) return;
  ++client->offered;
  if (!outcome.result) return;
  ++client->results;
  client->receive(timeline.bin(), huesOf(sensor, *outcome.result, true));
}

void Plot::setOption(const CallOutcome& outcome, PlotLane& client) {
  const size_t now = timeline.nextBin();
  client.at(now).asks = true;
  client.at(now).isRefused |= outcome.failed;
  client.addNote(now,
                 {.text = (outcome.failed ? "refused: " : "") + optionText(outcome.sensor->name, outcome.call.option),
                  .isRefused = outcome.failed});
}

Plot::Group& Plot::groupOf(const Sensor& sensor) {
  const auto known =
      std::find_if(groups.begin(), groups.end(), [&sensor](const Group& group) { return group.sensor == &sensor; });
  return known != groups.end() ? *known : groups.emplace_back(Group{.sensor = &sensor});
}

PlotLane* Plot::clientOf(Group& group, const std::string& session) {
  const auto known = std::find_if(group.clients.begin(), group.clients.end(),
                                  [&session](const PlotLane& lane) { return lane.name == session; });
  if (known != group.clients.end()) return &*known;
  if (clients == kMostClients) {
    leftOut.emplace(group.sensor, session);
    return nullptr;
  }
  ++clients;
  return &group.clients.emplace_back(session);
}

}  // namespace senseloom::tool
