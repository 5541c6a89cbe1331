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

std::string valueText(const ExpectedProperty& property) {
  return property.value ? std::to_string(*property.value) : std::to_string(property.size) + " bytes";
}

bool agree(const Property& returned, const ExpectedProperty& expected) {
  if (returned.id != expected.id || returned.value.size() != expected.size) return false;
  return returned.integer() == expected.value;
}

const OptionProperty* propertyOf(const OptionDescription& kind, size_t key) {
  const auto found =
      std::find_if(kind.properties.begin(), kind.properties.end(),
                   [&kind, key](const OptionProperty& property) { return kind.findKey(property.name) == key; });
  return found == kind.properties.end() ? nullptr : &*found;
}

std::string returnedText(const PropertyList& list, const OptionProperty* property) {
  if (property == nullptr) return "";
  const auto found =
      std::find_if(list.begin(), list.end(), [property](const Property& entry) { return entry.id == property->id; });
  return found == list.end() ? "" : std::to_string(found->id) + " = " + valueText(*found);
}

class Table {
 public:
  Table(const std::vector<Participant>& all, const MergeDerivation& derived, const PropertyList& list)
      : participants(all), derivation(derived), properties(list), kind(all.front().wishes->kind()) {}

  void print(std::FILE* out) {
    TextRow heading{"key", "merged to"};
    for (const Participant& participant : participants) heading.push_back(participant.name);
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

  void addKey(size_t key) {
    const MergedKey& merged = derivation.keys[key];
    TextRow row{kind.keys[key].name, merged.value ? mergeText(kind.keys[key].merge) : ""};
    for (const Participant& participant : participants) row.push_back(participant.wishes->at(key).text());
    addRow(std::move(row), merged.value ? std::to_string(*merged.value) : "",
           returnedText(properties, propertyOf(kind, key)), merged.decidedBy);
  }

  // Entries that show no single key: each with its name and no wishes.
  void addComputedProperties() {
    for (const Property& entry : properties) {
      const auto property = std::find_if(kind.properties.begin(), kind.properties.end(),
                                         [&entry](const OptionProperty& known) { return known.id == entry.id; });
      if (property == kind.properties.end() || kind.findKey(property->name) < kind.keys.size()) continue;
      TextRow row(2 + participants.size());
      row[0] = property->name;
      addRow(std::move(row), "", std::to_string(entry.id) + " = " + valueText(entry), "");
    }
  }

  const std::vector<Participant>& participants;
  const MergeDerivation& derivation;
  const PropertyList& properties;
  const OptionDescription& kind;
  std::vector<TextRow> rows;
};

// Compares the two lists entry by entry.
void printDifferences(std::FILE* out, const MergeDerivation& derivation, const std::optional<PropertyList>& returned) {
  if (derivation.properties.has_value() != returned.has_value()) {
    std::fprintf(out, "  unexplained: the library returned %s property list\n", returned ? "a" : "no");
    return;
  }
  if (!returned) return;
  const auto& expected = *derivation.properties;
  for (size_t i = 0; i < std::max(expected.size(), returned->size()); ++i) {
    if (i < expected.size() && i < returned->size() && agree((*returned)[i], expected[i])) continue;
    const auto text = [i](const auto& list) {
      return i < list.size() ? std::to_string(list[i].id) + " = " + valueText(list[i]) : std::string("nothing");
    };
    std::fprintf(out, "  unexplained: property %s, where %s was derived\n", text(*returned).c_str(),
                 text(expected).c_str());
  }
}

}  // namespace

void printNegotiation(std::FILE* out, const std::vector<Participant>& participants, const MergeDerivation& derivation,
                      const std::optional<PropertyList>& returned) {
  Table(participants, derivation, returned.value_or(PropertyList())).print(out);
  printDifferences(out, derivation, returned);
}

}  // namespace senseloom::tool
