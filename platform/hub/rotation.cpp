#include "rotation.h"

#include <array>
#include <cstddef>

namespace hub {
namespace {

// The angles whose tangents are 1, 1/2, 1/4 and so on, in nanoradians.
constexpr std::array<std::int64_t, 22> kAngles = {
    785'398'163, 463'647'609, 244'978'663, 124'354'995, 62'418'810, 31'239'833, 15'623'729, 7'812'341,
    3'906'230,   1'953'123,   976'562,     488'281,     244'141,    122'070,    61'035,     30'518,
    15'259,      7'629,       3'815,       1'907,       954,        477};
constexpr std::int64_t kUnit = 1'000;         // parts of a millionth that it computes with
constexpr std::int64_t kStart = 607'252'935;  // what turning by all of them makes a million of

}  // namespace

Direction directionOf(std::int64_t angle) {
  const bool isBehind = angle > kHalfTurn / 2 || angle < -kHalfTurn / 2;
  if (isBehind) angle += angle > 0 ? -kHalfTurn : kHalfTurn;
  std::int64_t x = kStart;
  std::int64_t y = 0;
  for (std::size_t i = 0; i < kAngles.size(); ++i) {
    const std::int64_t power = std::int64_t{1} << i;
    const std::int64_t turn = angle < 0 ? -1 : 1;
    const std::int64_t before = x;
    x -= turn * (y / power);
    y += turn * (before / power);
    angle -= turn * kAngles[i];
  }
  const std::int64_t unit = isBehind ? -kUnit : kUnit;
  return {.cosine = x / unit, .sine = y / unit};
}

}  // namespace hub
