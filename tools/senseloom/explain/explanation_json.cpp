#include "explain/explanation_json.h"

#include <utility>

#include "kinds/option_data.h"
#include "trace/json.h"
#include "trace/property_text.h"

namespace senseloom::tool {
namespace {

Json textOrNull(const std::string& value) {
  return value.empty() ? Json(json_null()) : textJson(value);
}
Json count(size_t value) {
  return Json(json_integer(static_cast<json_int_t>(value)));
}
Json valueOf(const model::MergedKey& key) {
  return Json(key.value ? json_integer(*key.value) : json_null());
}
Json headOf(const CallOutcome& outcome) {
  Json object(json_object());
  addMember(object, "line", outcome.call.line == 0 ? Json(json_null()) : count(outcome.call.line));
  addMember(object, "call", textJson(callName(outcome.call.kind)));
  addMember(object, "session", textJson(outcome.session));
  addMember(object, "sensor", textJson(outcome.sensor->name));
  return object;
}

void addTold(const Json& array, const std::vector<Told>& told) {
  constexpr const char* kAbout[] = {"remark", "refusal", "loss", "note", "unexplained", "logged"};
  for (const Told& one : told) {
    Json object(json_object());
    addMember(object, "about", textJson(kAbout[one.about]));
    addMember(object, "text", textJson(one.text));
    addMember(object, "logged", textOrNull(one.logLine));
    appendElement(array, std::move(object));
  }
}

Json requestJson(const std::string& session, const model::Requested& requested) {
  Json request(json_object());
  addMember(request, "session", textJson(session));
  addMember(request, "value", Json(json_integer(requested.value)));
  addMember(request, "asked", Json(json_integer(requested.asked)));
  addMember(request, "isDefault", Json(json_boolean(requested.isDefault)));
  return request;
}

Json keyJson(const ExplainedNegotiation& negotiation, const model::Key& key, size_t index,
             const std::vector<size_t>& sessions) {
  const model::MergedKey& merged = negotiation.derived->keys[index];
  Json object(json_object());
  addMember(object, "key", textJson(key.name));
  addMember(object, "rule", textJson(model::ruleText(key.merge)));
  Json requests(json_array());
  for (const size_t session : sessions) {
    appendElement(requests,
                  requestJson(negotiation.names[session], negotiation.derived->participants[session].request[index]));
  }
  addMember(object, "requests", std::move(requests));
  addMember(object, "merged", valueOf(merged));
  addMember(object, "before",
            negotiation.before == nullptr ? Json(json_null()) : valueOf((*negotiation.before)[index]));
  Json deciders(json_array());
  for (const size_t decider : merged.decidedBy) appendElement(deciders, textJson(negotiation.names[decider]));
  addMember(object, "decidedBy", std::move(deciders));
  return object;
}

Json negotiationJson(const Sensor& sensor, const ExplainedNegotiation& negotiation, bool whole) {
  const std::vector<size_t> shownKeys = negotiation.keysToShow(whole);
  const auto& keyRows = model::rowOf(model::kindNamed(sensor.name)).keys;
  Json keys(json_array());
  for (const size_t key : shownKeys) {
    appendElement(keys, keyJson(negotiation, keyRows.begin()[key], key, negotiation.sessionsToShow(shownKeys, whole)));
  }
  Json properties(json_array());
  for (const Property& property : negotiation.properties->value_or(PropertyList())) {
    Json entry(json_object());
    addMember(entry, "id", Json(json_integer(property.id)));
    addMember(entry, "name", textJson(propertyName(sensor.name, property.id)));
    addMember(entry, "text", textJson(valueText(sensor, property)));
    appendElement(properties, std::move(entry));
  }
  Json chains(json_array());
  for (const size_t session : negotiation.restarted) {
    Json chain(json_object());
    addMember(chain, "session", textJson(negotiation.names[session]));
    addMember(chain, "text", textJson(negotiation.derived->participants[session].chain));
    appendElement(chains, std::move(chain));
  }
  Json object(json_object());
  addMember(object, "sessions", count(negotiation.names.size()));
  addMember(object, "keys", std::move(keys));
  addMember(object, "properties", std::move(properties));
  addMember(object, "chains", std::move(chains));
  return object;
}

}  // namespace

Json toldJson(const ExplainedCall& call) {
  Json told(json_array());
  addTold(told, call.told);
  addTold(told, call.toldAfter);
  return told;
}

void ExplanationJson::onCall(const ExplainedCall& call) {
  if (extent.problems && !call.isProblem()) return;
  Json object = headOf(call.outcome);
  const auto& option = call.outcome.call.option;
  if (call.outcome.call.kind == CallKind::setOption)
    addMember(object, "option", option ? textJson(*option) : Json(json_null()));
  addMember(object, "told", toldJson(call));
  addMember(object, "negotiation",
            call.negotiation ? negotiationJson(*call.outcome.sensor, *call.negotiation,
                                               extent.all || !call.negotiation->hasManySessions())
                             : Json(json_null()));
  std::fprintf(out, "%s\n", compactText(object.get()).c_str());
}

void ExplanationJson::onRecord(const ExplainedRecord& record) {
  if (extent.problems ? !record.isProblem() : !extent.records && record.unexplained.empty()) return;
  Json object = headOf(record.outcome);
  addMember(object, "fate", textJson(model::fateText(record.verdict.fate)));
  addMember(object, "why", textJson(record.verdict.text()));
  addMember(object, "unexplained", textOrNull(record.unexplained));
  std::fprintf(out, "%s\n", compactText(object.get()).c_str());
}

void ExplanationJson::onEnd(const std::vector<Account>& accounts) {
  if (extent.problems) return;
  for (const Account& account : accounts) {
    Json fates(json_object());
    for (size_t fate = 0; fate < model::kFates; ++fate) {
      if (account.fates[fate] > 0)
        addMember(fates, model::fateText(static_cast<model::Fate>(fate)), count(account.fates[fate]));
    }
    Json object(json_object());
    addMember(object, "account", textJson(account.session));
    addMember(object, "sensor", textJson(account.sensor->name));
    addMember(object, "records", count(account.records()));
    addMember(object, "fates", std::move(fates));
    addMember(object, "unexplained", count(account.unexplained));
    addMember(object, "chain", textOrNull(account.chain));
    std::fprintf(out, "%s\n", compactText(object.get()).c_str());
  }
}

}  // namespace senseloom::tool
