#include "templates.h"

namespace gesture {

#include "templates.inc"

std::span<const Template> templates() {
  return kTemplates;
}

Points pointsOf(const Template& learned) {
  Points points;
  const char* value = learned.values;
  for (Point& point : points) {
    for (std::int8_t& axis : point) {
      axis = static_cast<std::int8_t>(*value - (*value < '@' ? '?' : '@'));
      ++value;
    }
  }
  return points;
}

}  // namespace gesture
