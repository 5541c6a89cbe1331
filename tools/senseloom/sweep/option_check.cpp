#include "sweep/option_check.h"

#include <algorithm>

#include "model/option_reading.h"

namespace senseloom::tool {
namespace {

// An option as the library reads it.
struct Reading {
  Reading(int kind, const std::string& option) : request(kind) {
    model::Templates templates;
    model::Log log;
    isAccepted = model::readOption(request, option.c_str(), true, {templates, log, &remarks});
  }

  model::Request request;
  std::vector<model::Remark> remarks;
  bool isAccepted = false;
};

// The option without the combination.
std::string closed(const std::string& head) {
  return (head.ends_with(',') ? head.substr(0, head.size() - 1) : head) + '}';
}

std::string replacedText(const char* key, int64_t given, int32_t value) {
  return '"' + std::string(key) + "\" " + std::to_string(given) + " becomes " + std::to_string(value);
}

}  // namespace

std::vector<std::string> remarksOn(const Sensor& sensor, const std::string& head, const SweepGrid& grid,
                                   size_t combination) {
  const int kind = model::kindNamed(sensor.name);
  const Reading whole(kind, head + grid.members(combination) + '}');
  std::vector<std::string> found;
  if (!whole.isAccepted) {
    found.emplace_back("the option is refused");
    for (const model::Remark& remark : whole.remarks) found[0] += ": " + remark.text;
    return found;
  }
  if (whole.remarks.empty()) return found;  // there is one for every value that is replaced

  const Reading before(kind, closed(head));
  const auto values = grid.values(combination);
  for (size_t i = 0; i < model::rowOf(kind).keys.size(); ++i) {
    const char* key = model::keyOf(kind, i).name;
    const model::Requested& requested = whole.request[i];
    const auto axis = std::ranges::find(grid.axes(), key, &SweepAxis::key);
    const bool isSwept = axis != grid.axes().end();
    const int64_t given = isSwept ? values[static_cast<size_t>(axis - grid.axes().begin())] : requested.asked;
    if (requested.value == given || (!isSwept && requested == before.request[i])) continue;
    found.push_back(replacedText(key, given, requested.value));
  }
  return found;
}

}  // namespace senseloom::tool
