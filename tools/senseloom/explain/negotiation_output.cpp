#include "explain/negotiation_output.h"

#include <algorithm>
#include <string>
#include <utility>

#include "terminal/text_table.h"
#include "trace/hex.h"

namespace senseloom::tool {
namespace {

constexpr size_t kMostBytesShown = 8;

std::string valueText(const Property& property) {
  if (const auto number = property.integer()) return std::to_string(*number);
  const std::string digits = toHex(std::span(property.value).first(std::min(property.value.size(), kMostBytesShown)));
  return digits + (property.value.size() > kMostBytesShown ? "..." : "") + " (" +
         std::to_string(property.value.size()) + " bytes)";
}

const model::PropertyRow* propertyOf(const model::KindRow& kind, const std::string& key) {
  const auto* found = std::find_if(kind.properties.begin(), kind.properties.end(),
                                   [&key](auto& property) { return property.key != nullptr && property.key == key; });
  return found == kind.properties.end() ? nullptr : found;
}

std::string returnedText(const PropertyList& list, const model::PropertyRow* property) {
  if (property == nullptr) return "";
  const auto found =
      std::find_if(list.begin(), list.end(), [property](const Property& entry) { return entry.id == property->id; });
  return found == list.end() ? "" : std::to_string(found->id) + " = " + valueText(*found);
}

class Table {
 public:
  Table(const model::Negotiation& derived, const std::vector<std::string>& participants, const PropertyList& list)
      : negotiation(derived),
        names(participants),
        properties(list),
        kind(model::rowOf(derived.participants.front().request.kind())) {}

  void print(std::FILE* out) {
    TextRow heading{"key", "merged to"};
    heading.insert(heading.end(), names.begin(), names.end());
    addRow(heading, "merged", "property", "decided by");
    for (size_t key = 0; key < kind.keys.size(); ++key) addKey(key);
    addComputedProperties();
    printTable(out, rows);
  }

 private:
  void addRow(TextRow row, std::string merged, std::string property, std::string decidedBy) {
    row.push_back(std::move(merged));
    row.push_back(std::move(property));
    row.push_back(std::move(decidedBy));
    rows.push_back(std::move(row));
  }

  void addKey(size_t index) {
    const model::Key& key = kind.keys.begin()[index];
    const model::MergedKey& merged = negotiation.keys[index];
    TextRow row{key.name, merged.value ? model::ruleText(key.merge) : ""};
    for (const auto& participant : negotiation.participants) row.push_back(participant.request[index].text());
    addRow(std::move(row), merged.value ? std::to_string(*merged.value) : "",
           returnedText(properties, propertyOf(kind, key.name)), merged.deciders(names));
  }

  // Entries that show no single key: each with its name and nothing that was asked for.
  void addComputedProperties() {
    for (const Property& entry : properties) {
      const auto* property = std::find_if(kind.properties.begin(), kind.properties.end(),
                                          [&entry](auto& known) { return known.id == entry.id; });
      if (property == kind.properties.end() || property->key != nullptr) continue;
      TextRow row(2 + names.size());
      row[0] = property->name;
      addRow(std::move(row), "", std::to_string(entry.id) + " = " + valueText(entry), "");
    }
  }

  const model::Negotiation& negotiation;
  const std::vector<std::string>& names;
  const PropertyList& properties;
  const model::KindRow& kind;
  std::vector<TextRow> rows;
};

// Compares the two lists entry by entry.
void printDifferences(std::FILE* out, const std::optional<model::PropertyList>& expected,
                      const std::optional<PropertyList>& returned) {
  if (expected.has_value() != returned.has_value()) {
    std::fprintf(out, "  unexplained: the library returned %s property list\n", returned ? "a" : "no");
    return;
  }
  if (!returned) return;
  PropertyList derived;
  for (const model::Property& entry : *expected)
    derived.push_back({entry.id, {entry.value.begin(), entry.value.end()}});
  for (size_t i = 0; i < std::max(derived.size(), returned->size()); ++i) {
    const auto text = [i](const PropertyList& list) {
      return i < list.size() ? std::to_string(list[i].id) + " = " + valueText(list[i]) : std::string("nothing");
    };
    const bool hasBoth = i < derived.size() && i < returned->size();
    if (hasBoth && derived[i].id == (*returned)[i].id && derived[i].value == (*returned)[i].value) continue;
    std::fprintf(out, "  unexplained: property %s, where %s was derived\n", text(*returned).c_str(),
                 text(derived).c_str());
  }
}

}  // namespace

void printNegotiation(std::FILE* out, const model::Negotiation& negotiation, const std::vector<std::string>& names,
                      const std::optional<model::PropertyList>& expected, const std::optional<PropertyList>& returned) {
  Table(negotiation, names, returned.value_or(PropertyList())).print(out);
  printDifferences(out, expected, returned);
}

}  // namespace senseloom::tool
