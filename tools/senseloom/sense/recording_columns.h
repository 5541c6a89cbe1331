#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

namespace senseloom::tool {

// What a recording of sensors can have a column for.
enum class Quantity : uint8_t { time, ax, ay, az, gx, gy, gz, pressure, label, part };
inline constexpr size_t kQuantities = 10;

// The names of the columns, and what their numbers mean.
struct RecordingColumns {
  std::array<std::string, kQuantities> names;
  std::array<double, kQuantities> factors;  // to ns, mm/s², mrad/s and Pa

  const std::string& nameOf(Quantity quantity) const { return names[static_cast<size_t>(quantity)]; }
  double factorOf(Quantity quantity) const { return factors[static_cast<size_t>(quantity)]; }
};

// Those of data/ ("mm": ms, mm/s², mrad/s, Pa) or of SI ("si": s, m/s², rad/s, hPa), with other names as `columns`
// says, such as "time=seconds,ax=x". `timeUnit` is s, ms, us or ns, or empty for that of the units. Throws InputError.
RecordingColumns recordingColumns(const std::string& units, const std::string& columns, const std::string& timeUnit);

}  // namespace senseloom::tool
