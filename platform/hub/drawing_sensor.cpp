#include "drawing_sensor.h"

#include <cstdint>

namespace hub {
namespace {

void addRecord(std::int64_t time, const Movement& movement, Records& records) {
  if (movement.empty()) return;
  constexpr std::int16_t kCounts = 0;  // what the engine recognises in it counts
  Record& record = records.emplace_back(DrawingSensor::kName, time);
  record.append(kCounts);
  record.append(static_cast<std::uint16_t>(movement.size() * sizeof(Group)));
  for (const Group& group : movement) record.append(group);
}

}  // namespace

void DrawingSensor::take(const Sample& sample, Records& records) {
  addRecord(sample.time, finder.take(sample), records);
}

void DrawingSensor::finish(std::int64_t time, Records& records) {
  addRecord(time, finder.finish(), records);
}

}  // namespace hub
