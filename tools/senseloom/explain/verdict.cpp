#include "explain/verdict.h"

#include <array>
#include <cstdio>

namespace senseloom::tool {
namespace {

struct FateRow {
  const char* text;
  const char* numbers;  // format of the verdict's two numbers
};
// In the order of the fates.
constexpr FateRow kRows[kFates] = {
    {"delivered", ""},
    {"batch filling", ": %d of %d items"},
    {"class not wanted", ": bits %d, mask %d"},
    {"unchanged", ": class %d as before"},
    {"step not a multiple", ": %d is none of %d"},
    {"no gesture recognised", ""},
    {"no items", ""},
    {"too short", ": ends before its class or count"},
    {"refused", ""},
};

const FateRow& rowOf(Fate fate) {
  return kRows[static_cast<size_t>(fate)];
}

}  // namespace

const char* fateText(Fate fate) {
  return rowOf(fate).text;
}

int Verdict::returned() const {
  if (fate == Fate::refused) return -1;
  return fate == Fate::delivered ? 1 : 0;
}

std::string Verdict::text() const {
  std::array<char, 64> numbers;
  std::snprintf(numbers.data(), numbers.size(), rowOf(fate).numbers, first, second);
  return std::string(fateText(fate)) + numbers.data();
}

}  // namespace senseloom::tool
