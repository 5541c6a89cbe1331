#include "held_lists.h"

#include <utility>

namespace oracle {

HeldLists::~HeldLists() {
  for (const Held& held : lists) ctx_option_release(held.list);
}

void HeldLists::take(int sensor, const Observation& observation, const Model& model) {
  Held& held = lists[static_cast<size_t>(sensor)];
  ctx_option_release(held.list);
  held = {observation.list, *observation.outcome.list, model.negotiations(sensor)};
}

std::string HeldLists::difference(const Model& model) {
  for (int sensor = 0; sensor < kSensors; ++sensor) {
    Held& held = lists[static_cast<size_t>(sensor)];
    if (held.list == nullptr) continue;
    if (held.negotiations != model.negotiations(sensor)) {
      ctx_option_release(std::exchange(held.list, nullptr));
      continue;
    }
    // Templates are pointed at where they are stored, and change with any option string that has one.
    for (Property& property : held.properties) {
      if (property.slot >= 0) property.value = model.templateBytes(property.slot, property.value.size());
    }
    std::string complaint;
    if (propertiesOf(held.list, complaint) != held.properties) return "an earlier property list has changed; ";
  }
  return "";
}

}  // namespace oracle
