#include "view/page_data.h"

#include <algorithm>
#include <utility>

#include "explain/explanation_json.h"
#include "explain/negotiation_table.h"
#include "kinds/option_data.h"
#include "trace/record_field.h"

namespace senseloom::tool {
namespace {

Json number(size_t value) {
  return Json(json_integer(static_cast<json_int_t>(value)));
}

Json fateNames() {
  Json names(json_array());
  for (size_t fate = 0; fate < model::kFates; ++fate) {
    appendElement(names, textJson(model::fateText(static_cast<model::Fate>(fate))));
  }
  appendElement(names, textJson("unexplained"));
  return names;
}

Json textsJson(const std::vector<std::string>& texts) {
  Json array(json_array());
  for (const std::string& text : texts) appendElement(array, textJson(text));
  return array;
}

// The words for what records and results of a sensor show, by hue; null for what none of them shows.
Json hueTexts(const Sensor& sensor, const RecordHues& shown, const std::vector<std::string>& classNames) {
  Json texts(json_array());
  for (size_t hue = 0; hue < kHues; ++hue) {
    appendElement(texts, shown.counts[hue] == 0 ? Json(json_null()) : textJson(hueText(sensor, hue, classNames)));
  }
  return texts;
}

}  // namespace

void PageData::onOutcome(const CallOutcome& outcome) {
  if (filter.takes(outcome)) {
    if (outcome.call.line != 0 && outcome.call.line != lastLine) ++calls;
    lastLine = outcome.call.line;
    const bool isOpen = outcome.call.kind == CallKind::open;
    if (isOpen && !outcome.failed) addEvent(outcome, Json(json_object()));
  }
  explainer.onOutcome(outcome);
}

void PageData::onEnd() {
  explainer.onEnd();
}

Json PageData::summary(const std::vector<std::string>& classNames) const {
  Json summary(json_object());
  addMember(summary, "calls", number(calls));
  records.describe(summary);
  Json sensorRows(json_array());
  for (const ShownSensor& shown : sensors) {
    const Sensor& sensor = *shown.sensor;
    Json row(json_object());
    addMember(row, "name", textJson(sensor.name));
    addMember(row, "title", textJson(findOptionDescription(sensor.name)->title));
    addMember(row, "lane", number(shown.lane));
    addMember(row, "lasts", Json(json_boolean(sensor.lasts)));
    addMember(row, "isAmount", Json(json_boolean(!hasClasses(sensor))));
    addMember(row, "hues", hueTexts(sensor, shown.shown, classNames));
    appendElement(sensorRows, std::move(row));
  }
  addMember(summary, "sensors", std::move(sensorRows));
  Json clientRows(json_array());
  for (const Client& client : clients) {
    Json row(json_object());
    addMember(row, "name", textJson(client.name));
    addMember(row, "sensor", number(client.sensor));
    addMember(row, "lane", number(client.lane));
    addMember(row, "results", number(client.results));
    Json fates(json_array());
    for (const size_t count : client.fates) appendElement(fates, number(count));
    addMember(row, "fates", std::move(fates));
    appendElement(clientRows, std::move(row));
  }
  addMember(summary, "sessions", std::move(clientRows));
  addMember(summary, "fates", fateNames());
  addMember(summary, "events", Json(json_incref(events.get())));
  return summary;
}

void PageData::onRecord(const ExplainedRecord& explained) {
  const CallOutcome& outcome = explained.outcome;
  const uint32_t client = clientOf(outcome);
  if (joiner.isNew(outcome)) {
    endRecord();
    beginRecord(outcome);
  }
  const bool isExplained = explained.unexplained.empty();
  const PageVerdict verdict = isExplained
                                  ? PageVerdict{static_cast<uint32_t>(explained.verdict.fate), explained.verdict.text()}
                                  : PageVerdict{kUnexplainedFate, "unexplained: " + explained.unexplained};
  ++clients[client].fates[verdict.fate];
  std::optional<RecordHues> result;
  if (outcome.result) {
    result = huesOf(*outcome.sensor, *outcome.result, true);
    sensors[clients[client].sensor].shown.add(*result);
    ++clients[client].results;
  }
  record->receptions.push_back(
      {.client = client, .lane = clients[client].lane, .verdict = verdict, .result = std::move(result)});
}

void PageData::onCall(const ExplainedCall& call) {
  Json event(json_object());
  addMember(event, "says", textJson(call.what));
  addMember(event, "told", toldJson(call));
  if (call.negotiation) {
    Json rows(json_array());
    for (const TextRow& row : fewSessionsRows(*call.outcome.sensor, *call.negotiation, true))
      appendElement(rows, textsJson(row));
    addMember(event, "table", std::move(rows));
    addMember(event, "chains", textsJson(chainTexts(*call.negotiation, false)));
  }
  addEvent(call.outcome, std::move(event));
}

void PageData::onEnd(const std::vector<Account>& /*accounts*/) {
  endRecord();
  records.end();
}

void PageData::beginRecord(const CallOutcome& outcome) {
  const uint32_t sensor = sensorOf(outcome.sensor);
  timestamp = recordField<uint64_t>(outcome.record, kTimestampOffset).value_or(timestamp);
  record = PageRecord{.line = outcome.call.line,
                      .sensor = sensor,
                      .lane = sensors[sensor].lane,
                      .timestamp = timestamp,
                      .shown = huesOf(*outcome.sensor, outcome.record, false),
                      .receptions = {}};
  sensors[sensor].shown.add(record->shown);
}

void PageData::endRecord() {
  if (!record) return;
  records.add(*record);
  for (; timedEvents < json_array_size(events.get()); ++timedEvents) {
    const auto time = static_cast<json_int_t>(record->timestamp - records.firstTime());
    json_object_set_new(json_array_get(events.get(), timedEvents), "time", json_integer(time));
  }
  record.reset();
}

void PageData::addEvent(const CallOutcome& outcome, Json event) {
  endRecord();
  joiner.end();
  addMember(event, "call", textJson(callName(outcome.call.kind)));
  addMember(event, "line", number(outcome.call.line));
  addMember(event, "failed", Json(json_boolean(outcome.failed)));
  addMember(event, "at", number(records.count()));
  addMember(event, "session", number(clientOf(outcome)));
  appendElement(events, std::move(event));
}

uint32_t PageData::sensorOf(const Sensor* sensor) {
  const auto known = std::ranges::find(sensors, sensor, &ShownSensor::sensor);
  if (known != sensors.end()) return static_cast<uint32_t>(known - sensors.begin());
  sensors.push_back({.sensor = sensor, .lane = lanes++});
  return static_cast<uint32_t>(sensors.size() - 1);
}

uint32_t PageData::clientOf(const CallOutcome& outcome) {
  const uint32_t sensor = sensorOf(outcome.sensor);
  const auto known = std::ranges::find_if(
      clients, [&](const Client& client) { return client.sensor == sensor && client.name == outcome.session; });
  if (known != clients.end()) return static_cast<uint32_t>(known - clients.begin());
  clients.push_back({.name = outcome.session, .sensor = sensor, .lane = lanes++});
  return static_cast<uint32_t>(clients.size() - 1);
}

}  // namespace senseloom::tool
