#include "drawings.h"

#include <gtest/gtest.h>

#include <array>
#include <cmath>
#include <cstdint>
#include <cstdio>
#include <string>

namespace {

std::int16_t milligravities(int acceleration) {
  return static_cast<std::int16_t>(std::lround(acceleration / 9.80665));
}

}  // namespace

std::vector<Record> drawingsOf(int digit) {
  const std::string command = "gzip -dc " DIGITS "/digit_" + std::to_string(digit) + ".csv.gz";
  std::FILE* const file = popen(command.c_str(), "r");
  if (file == nullptr || std::fscanf(file, "%*[^\n]") == EOF) {
    ADD_FAILURE() << command;
    return {};
  }
  std::vector<Record> drawings;
  int number = 0;
  int before = -1;
  bool take = false;
  std::array<int, gesture::kAxes> v;
  while (std::fscanf(file, "%d,%*d,%d,%d,%d,%d,%d,%d", &number, &v[0], &v[1], &v[2], &v[3], &v[4], &v[5]) == 7) {
    take = number != before || !take;
    if (number != before) drawings.emplace_back();
    before = number;
    if (!take) continue;
    gesture::Group& group = drawings.back().emplace_back();
    for (std::size_t axis = 0; axis < v.size(); ++axis) {
      group[axis] = axis < 3 ? milligravities(v[axis]) : static_cast<std::int16_t>(v[axis]);
    }
  }
  EXPECT_EQ(pclose(file), 0) << command;
  return drawings;
}

Record leftAndRight(int groupsEach) {
  Record record(static_cast<std::size_t>(groupsEach), {50, 0, 0, 0, 0, 100});
  record.insert(record.end(), static_cast<std::size_t>(groupsEach), {-50, 0, 0, 0, 0, -100});
  return record;
}
