#include "explain/negotiation_table.h"

#include <algorithm>
#include <string>
#include <utility>

#include "explain/named_groups.h"
#include "terminal/text_table.h"
#include "trace/property_text.h"

namespace senseloom::tool {
namespace {

// The cells of the tables.
class Cells {
 public:
  Cells(const Sensor& ofSensor, const ExplainedNegotiation& toPrint)
      : sensor(ofSensor), negotiation(toPrint), kind(model::rowOf(model::kindNamed(ofSensor.name))) {
    if (*negotiation.properties) properties = **negotiation.properties;
  }

  std::string keyName(size_t key) const { return kind.keys.begin()[key].name; }
  std::string rule(size_t key) const {
    return mergedKey(key).value ? model::ruleText(kind.keys.begin()[key].merge) : "";
  }
  std::string request(size_t participant, size_t key) const {
    return negotiation.derived->participants[participant].request[key].text();
  }
  std::string merged(size_t key) const { return text(mergedKey(key)); }
  std::string before(size_t key) const { return negotiation.before == nullptr ? "" : text((*negotiation.before)[key]); }
  std::string decidedBy(size_t key) const { return mergedKey(key).deciders(negotiation.names); }
  std::string property(size_t key) const {
    for (const model::PropertyRow& row : kind.properties) {
      if (row.key == nullptr || row.key != keyName(key)) continue;
      for (const Property& entry : properties) {
        if (entry.id == row.id) return entryText(entry);
      }
    }
    return "";
  }
  // Entries of the list that show no single key, each with its name.
  std::vector<std::pair<std::string, std::string>> computedProperties() const {
    std::vector<std::pair<std::string, std::string>> entries;
    for (const Property& entry : properties) {
      const auto* row = std::find_if(kind.properties.begin(), kind.properties.end(),
                                     [&entry](auto& known) { return known.id == entry.id; });
      if (row != kind.properties.end() && row->key == nullptr) entries.emplace_back(row->name, entryText(entry));
    }
    return entries;
  }

 private:
  const model::MergedKey& mergedKey(size_t key) const { return negotiation.derived->keys[key]; }
  std::string entryText(const Property& entry) const {
    return std::to_string(entry.id) + " = " + valueText(sensor, entry);
  }
  static std::string text(const model::MergedKey& key) { return key.value ? std::to_string(*key.value) : ""; }

  const Sensor& sensor;
  const ExplainedNegotiation& negotiation;
  const model::KindRow& kind;
  PropertyList properties;  // that the library returned
};

}  // namespace

std::vector<TextRow> fewSessionsRows(const Sensor& sensor, const ExplainedNegotiation& negotiation, bool whole) {
  const Cells cells(sensor, negotiation);
  std::vector<TextRow> rows{{"key", "merged to"}};
  const auto finish = [&rows](const std::string& merged, const std::string& property, const std::string& decidedBy) {
    rows.back().insert(rows.back().end(), {merged, property, decidedBy});
  };
  rows.back().insert(rows.back().end(), negotiation.names.begin(), negotiation.names.end());
  finish("merged", "property", "decided by");
  for (const size_t key : negotiation.keysToShow(whole)) {
    rows.push_back({cells.keyName(key), cells.rule(key)});
    for (size_t i = 0; i < negotiation.names.size(); ++i) rows.back().push_back(cells.request(i, key));
    finish(cells.merged(key), cells.property(key), cells.decidedBy(key));
  }
  for (const auto& [name, text] : cells.computedProperties()) {
    rows.emplace_back(2 + negotiation.names.size());
    rows.back()[0] = name;
    finish("", text, "");
  }
  return rows;
}

void printFewSessions(std::FILE* out, const Sensor& sensor, const ExplainedNegotiation& negotiation, bool whole) {
  printTable(out, fewSessionsRows(sensor, negotiation, whole));
}

void printManySessions(std::FILE* out, const Sensor& sensor, const ExplainedNegotiation& negotiation, bool whole) {
  const Cells cells(sensor, negotiation);
  const std::vector<size_t> keys = negotiation.keysToShow(whole);
  const std::vector<size_t> sessions = negotiation.sessionsToShow(keys, whole);
  std::vector<TextRow> rows;
  const auto addRow = [&](const std::string& title, auto cell) {
    rows.push_back({title});
    for (const size_t key : keys) rows.back().push_back(cell(key));
  };
  addRow("session", [&](size_t key) { return cells.keyName(key); });
  for (const size_t session : sessions) {
    addRow(negotiation.names[session], [&](size_t key) { return cells.request(session, key); });
  }
  if (const size_t more = negotiation.names.size() - sessions.size(); more > 0) {
    addRow(std::to_string(more) + " more", [](size_t) { return "..."; });
  }
  addRow("merged to", [&](size_t key) { return cells.rule(key); });
  addRow("merged", [&](size_t key) { return cells.merged(key); });
  if (negotiation.before != nullptr) addRow("before", [&](size_t key) { return cells.before(key); });
  addRow("property", [&](size_t key) { return cells.property(key); });
  addRow("decided by", [&](size_t key) { return cells.decidedBy(key); });
  if (!keys.empty()) printTable(out, rows);
  for (const auto& [name, text] : cells.computedProperties()) {
    std::fprintf(out, "  %s: %s\n", name.c_str(), text.c_str());
  }
}

std::vector<std::string> chainTexts(const ExplainedNegotiation& negotiation, bool all) {
  struct Chain {
    std::string session;
    std::string stages;
  };
  std::vector<Chain> chains;
  for (size_t i = 0; i < negotiation.names.size(); ++i) {
    const std::string& stages = negotiation.derived->participants[i].chain;
    const auto& restarted = negotiation.restarted;
    const bool isNew = std::find(restarted.begin(), restarted.end(), i) != restarted.end();
    if (!stages.empty() && (all || isNew)) chains.push_back({negotiation.names[i], stages});
  }
  const auto isSame = [](const Chain& one, const Chain& other) { return one.stages == other.stages; };
  std::vector<std::string> texts;
  for (const auto& group : groupsOf(chains, isSame)) {
    texts.push_back("chain of " + namesText(group, [](const Chain& chain) { return chain.session; }) + ": " +
                    group.front()->stages);
  }
  return texts;
}

void printChains(std::FILE* out, const ExplainedNegotiation& negotiation, bool all) {
  for (const std::string& text : chainTexts(negotiation, all)) std::fprintf(out, "  %s\n", text.c_str());
}

}  // namespace senseloom::tool
