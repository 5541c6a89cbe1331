#include "trace/property_text.h"

#include <algorithm>

#include "model/kinds.h"
#include "trace/hex.h"

namespace senseloom::tool {
namespace {

constexpr size_t kMostBytesShown = 16;

bool hasHalves(const Sensor& sensor, int32_t id) {
  const auto& rows = model::rowOf(model::kindNamed(sensor.name)).properties;
  return std::any_of(rows.begin(), rows.end(), [id](auto& row) { return row.id == id && row.hasHalves; });
}

}  // namespace

std::string bytesText(std::span<const uint8_t> bytes) {
  if (bytes.empty()) return "no bytes";
  const std::string digits = toHex(bytes.first(std::min(bytes.size(), kMostBytesShown)));
  if (bytes.size() <= kMostBytesShown) return digits;
  return digits + "... (" + std::to_string(bytes.size()) + " bytes)";
}

std::string valueText(const Property& property) {
  const auto number = property.integer();
  return number ? std::to_string(*number) : bytesText(property.value);
}

std::string valueText(const Sensor& sensor, const Property& property) {
  const std::string text = valueText(property);
  const auto number = property.integer();
  if (!number || !hasHalves(sensor, property.id)) return text;
  const auto bits = static_cast<uint32_t>(*number);
  return text + " (" + std::to_string(bits >> 16) + ", " + std::to_string(bits & 0xffff) + ')';
}

}  // namespace senseloom::tool
