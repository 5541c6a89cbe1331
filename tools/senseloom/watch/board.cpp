#include "watch/board.h"

#include <cstring>

#include "model/kinds.h"
#include "trace/json.h"
#include "trace/record_codec.h"
#include "trace/trace_form.h"

namespace senseloom::tool {
namespace {

constexpr char kDefaults[] = "defaults";

// The keys that were given, with the values that count.
std::string requestText(const Sensor& sensor, const model::Request& request) {
  std::string text;
  size_t key = 0;
  for (const model::Key& row : model::rowOf(model::kindNamed(sensor.name)).keys) {
    const model::Requested& requested = request[key++];
    if (requested.isDefault) continue;
    text.append(text.empty() ? "" : ", ").append(row.name).append(" ").append(std::to_string(requested.value));
  }
  return text.empty() ? kDefaults : text;
}

// What it holds beside times and sequence numbers.
std::string fieldsText(json_t* value) {
  if (json_is_string(value)) return json_string_value(value);
  if (!json_is_object(value) && !json_is_array(value)) return std::to_string(json_integer_value(value));
  std::string text;
  const char* key;
  json_t* item;
  json_object_foreach(value, key, item) {
    if (std::strcmp(key, member::kTimestamp) == 0 || std::strcmp(key, member::kSequence) == 0) continue;
    text.append(text.empty() ? "" : " ").append(key).append(" ").append(fieldsText(item));
  }
  size_t index;
  json_array_foreach(value, index, item) {
    text.append(text.empty() ? "" : ", ").append(fieldsText(item));
  }
  return text;
}

std::string resultText(const Sensor& sensor, const std::vector<uint8_t>& result) {
  if (result.empty()) return "";
  const Json fields = decodeResult(sensor, result);
  if (fields == nullptr) return std::to_string(result.size()) + " bytes";
  json_t* items = json_object_get(fields.get(), member::kItems);
  return fieldsText(items == nullptr ? fields.get() : items);
}

std::string reasonText(const Account& account) {
  size_t most = 0;
  std::string text;
  const auto consider = [&](size_t count, const char* reason) {
    if (count <= most) return;
    most = count;
    text = reason;
  };
  for (size_t i = 0; i < model::kFates; ++i) {
    const auto fate = static_cast<model::Fate>(i);
    if (fate != model::Fate::delivered) consider(account.fates[i], model::fateText(fate));
  }
  consider(account.unexplained, "unexplained");
  return most == 0 ? "" : text + ' ' + std::to_string(most);
}

}  // namespace

void Board::onOutcome(const CallOutcome& outcome) {
  if (outcome.sensor == nullptr || outcome.call.line == 0) return;  // the tool closes what is left open
  Client& client = clientOf(outcome.session, outcome.sensor);
  if (isWanted) client.isShown = true;
  switch (outcome.call.kind) {
    case CallKind::open:
      client.isOpen = !outcome.failed;
      client.request = kDefaults;
      break;
    case CallKind::close:
      client.isOpen = false;
      break;
    case CallKind::dispatch:
      if (!isWanted) break;
      ++client.records;
      if (!outcome.result) break;
      ++client.results;
      client.lastResult.assign(outcome.result->begin(), outcome.result->end());
      break;
    default:
      break;
  }
}

void Board::onCall(const ExplainedCall& call) {
  if (!call.negotiation) return;
  const Sensor* sensor = call.outcome.sensor;
  for (size_t i = 0; i < call.negotiation->names.size(); ++i) {
    const model::Request& request = call.negotiation->derived->participants[i].request;
    clientOf(call.negotiation->names[i], sensor).request = requestText(*sensor, request);
  }
}

void Board::onRecord(const ExplainedRecord& record) {
  if (!isWanted) return;
  Account& account = clientOf(record.outcome.session, record.outcome.sensor).account;
  ++(record.unexplained.empty() ? account.fates[static_cast<size_t>(record.verdict.fate)] : account.unexplained);
}

void Board::onEnd(const std::vector<Account>& accounts) {
  for (const Account& account : accounts) {
    const Client& client = clientOf(account.session, account.sensor);
    if (!client.isShown) continue;
    summary.push_back(account);
    summary.back().fates = client.account.fates;
    summary.back().unexplained = client.account.unexplained;
  }
}

void Board::measure(Clock::time_point now) {
  const bool isFirst = lastMeasurement == Clock::time_point::min();
  const std::chrono::duration<double> passed(isFirst ? Clock::duration::zero() : now - lastMeasurement);
  if (!isFirst && passed.count() < 1) return;
  for (Client& client : clients) {
    if (!isFirst) client.rate = static_cast<double>(client.records - client.measured) / passed.count();
    client.measured = client.records;
  }
  lastMeasurement = now;
}

std::vector<BoardRow> Board::rows() const {
  std::vector<BoardRow> rows;
  for (const Client& client : clients) {
    if (!client.isShown) continue;
    rows.push_back({.session = client.account.session,
                    .sensor = client.account.sensor->name,
                    .request = client.isOpen ? client.request : "closed",
                    .records = client.records,
                    .results = client.results,
                    .rate = client.rate,
                    .lastResult = resultText(*client.account.sensor, client.lastResult),
                    .reason = reasonText(client.account)});
  }
  return rows;
}

Board::Client& Board::clientOf(const std::string& session, const Sensor* sensor) {
  const auto [place, isNew] = places.try_emplace({sensor, session}, clients.size());
  if (isNew) clients.push_back({.account = {.session = session, .sensor = sensor}});
  return clients[place->second];
}

}  // namespace senseloom::tool
