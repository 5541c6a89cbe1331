// Recognises the digits 0 to 9 by the learned drawing that is nearest.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>

#include "drawing.h"

namespace gesture {

// The digit that was drawn, or nothing for anything that is not clearly a digit.
std::optional<int> recognise(std::span<const Group> record);

class Recogniser {
 public:
  // Takes the next group of a record. At its last, returns the name of the digit in it, or nullptr.
  const char* take(const std::int16_t* group, bool last);

 private:
  std::array<Group, kMostGroups> groups;
  std::size_t count = 0;  // of the record so far; one more than `groups` holds when it is too long
};

}  // namespace gesture
