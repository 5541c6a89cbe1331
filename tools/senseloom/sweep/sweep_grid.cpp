#include "sweep/sweep_grid.h"

#include <algorithm>
#include <charconv>
#include <string_view>
#include <utility>

#include "input_error.h"
#include "kinds/option_data.h"
#include "model/nearest_name.h"

namespace senseloom::tool {
namespace {

std::string quoted(std::string_view text) {
  return '"' + std::string(text) + '"';
}

int64_t integerIn(std::string_view text, std::string_view all) {
  int64_t value = 0;
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value);
  if (error != std::errc() || end != text.data() + text.size()) {
    throw InputError("--set " + std::string(all) + ": " + quoted(text) +
                     " is not an integer, nor a range such as 0..8");
  }
  return value;
}

// Appends the value, or the values of the range.
void addValues(std::string_view part, std::string_view all, std::vector<int64_t>& values) {
  const size_t dots = part.find("..");
  if (dots == std::string_view::npos) {
    values.push_back(integerIn(part, all));
    return;
  }
  const int64_t low = integerIn(part.substr(0, dots), all);
  const int64_t high = integerIn(part.substr(dots + 2), all);
  if (low > high) throw InputError("--set " + std::string(all) + ": the range " + quoted(part) + " is empty");
  // Subtracted without a sign, where the difference always fits.
  if (static_cast<uint64_t>(high) - static_cast<uint64_t>(low) >= SweepGrid::kMostCombinations) {
    throw InputError("--set " + std::string(all) + ": more than 1,000,000 values");
  }
  for (int64_t value = low; value < high; ++value) values.push_back(value);
  values.push_back(high);
}

void requireKey(const Sensor& sensor, const std::string& key) {
  const OptionDescription& kind = *findOptionDescription(sensor.name);
  if (kind.findKey(key) < kind.keys.size()) return;
  const std::string problem = "--set " + key + ": ";
  if (std::ranges::find(kind.stringKeys, key) != kind.stringKeys.end()) {
    throw InputError(problem + quoted(key) + " is not a key with integer values");
  }
  std::vector<std::string_view> known;
  for (const OptionKey& each : kind.keys) known.emplace_back(each.name);
  throw InputError(problem + sensor.name + " has no key " + quoted(key) + "; the nearest is " +
                   quoted(model::nearestName(key, known)));
}

}  // namespace

SweepAxis readAxis(const std::string& text) {
  const size_t equals = text.find('=');
  if (equals == std::string::npos || equals == 0) throw InputError("--set " + text + ": must be KEY=VALUES");
  SweepAxis axis{.key = text.substr(0, equals), .values = {}};
  std::string_view rest = std::string_view(text).substr(equals + 1);
  if (rest.empty()) throw InputError("--set " + text + ": no values");
  while (true) {
    const size_t comma = rest.find(',');
    addValues(rest.substr(0, comma), text, axis.values);
    if (comma == std::string_view::npos) break;
    rest.remove_prefix(comma + 1);
  }
  return axis;
}

SweepGrid::SweepGrid(const Sensor& sensor, std::vector<SweepAxis> axesOfKeys) : keys(std::move(axesOfKeys)) {
  for (size_t i = 0; i < keys.size(); ++i) {
    requireKey(sensor, keys[i].key);
    for (size_t other = 0; other < i; ++other) {
      if (keys[other].key == keys[i].key) throw InputError("--set " + keys[i].key + " is there twice");
    }
    if (keys[i].values.size() > kMostCombinations / count) {
      throw InputError("more than 1,000,000 combinations: narrow the values of --set");
    }
    count *= keys[i].values.size();
  }
}

std::vector<int64_t> SweepGrid::values(size_t combination) const {
  std::vector<int64_t> chosen(keys.size());
  for (size_t i = keys.size(); i-- > 0;) {
    chosen[i] = keys[i].values[combination % keys[i].values.size()];
    combination /= keys[i].values.size();
  }
  return chosen;
}

std::string SweepGrid::members(size_t combination) const {
  const auto chosen = values(combination);
  std::string text;
  for (size_t i = 0; i < keys.size(); ++i) {
    if (i > 0) text += ',';
    text += quoted(keys[i].key) + ':' + std::to_string(chosen[i]);
  }
  return text;
}

std::string SweepGrid::name(size_t combination) const {
  const auto chosen = values(combination);
  std::string text;
  for (size_t i = 0; i < keys.size(); ++i) {
    if (keys[i].values.size() == 1 && count > 1) continue;
    text += (text.empty() ? "" : ", ") + keys[i].key + ' ' + std::to_string(chosen[i]);
  }
  return text;
}

}  // namespace senseloom::tool
