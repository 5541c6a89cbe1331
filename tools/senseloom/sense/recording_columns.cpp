#include "sense/recording_columns.h"

#include <algorithm>

#include "input_error.h"
#include "trace/time_unit.h"

namespace senseloom::tool {
namespace {

constexpr size_t kUnits = 2;
constexpr std::array<std::string_view, kUnits> kUnitNames = {"mm", "si"};

// A row a quantity: what --columns calls it, and for each of kUnitNames the usual name and the factor of its column.
struct QuantityRow {
  const char* name;
  std::array<const char*, kUnits> columns;
  std::array<double, kUnits> factors;
};
constexpr std::array<QuantityRow, kQuantities> kRows{{
    {"time", {"t_ms", "t_s"}, {1e6, 1e9}},
    {"ax", {"ax_mm_s2", "ax_m_s2"}, {1, 1000}},
    {"ay", {"ay_mm_s2", "ay_m_s2"}, {1, 1000}},
    {"az", {"az_mm_s2", "az_m_s2"}, {1, 1000}},
    {"gx", {"gx_mrad_s", "gx_rad_s"}, {1, 1000}},
    {"gy", {"gy_mrad_s", "gy_rad_s"}, {1, 1000}},
    {"gz", {"gz_mrad_s", "gz_rad_s"}, {1, 1000}},
    {"pressure", {"p_pa", "p_hpa"}, {1, 100}},
    {"class", {"class", "class"}, {1, 1}},
    {"recording", {"drawing", "drawing"}, {1, 1}},
}};

void rename(RecordingColumns& columns, const std::string& text) {
  for (size_t from = 0; from <= text.size();) {
    const size_t to = std::min(text.find(',', from), text.size());
    const std::string part = text.substr(from, to - from);
    from = to + 1;
    const size_t equals = part.find('=');
    const auto* const row = std::ranges::find(kRows, part.substr(0, equals), &QuantityRow::name);
    if (row == kRows.end() || equals == std::string::npos || equals + 1 == part.size()) {
      throw InputError("--columns " + text +
                       ": must be some of time=NAME,ax=NAME,ay=NAME,az=NAME,gx=NAME,gy=NAME,gz=NAME,pressure=NAME,"
                       "class=NAME,recording=NAME");
    }
    columns.names[static_cast<size_t>(row - kRows.begin())] = part.substr(equals + 1);
  }
}

}  // namespace

RecordingColumns recordingColumns(const std::string& units, const std::string& columns, const std::string& timeUnit) {
  const auto unit = static_cast<size_t>(std::ranges::find(kUnitNames, units) - kUnitNames.begin());
  if (unit == kUnits) throw InputError("unknown units \"" + units + "\": mm and si are known");
  RecordingColumns result;
  for (size_t i = 0; i < kQuantities; ++i) {
    result.names[i] = kRows[i].columns[unit];
    result.factors[i] = kRows[i].factors[unit];
  }
  if (!timeUnit.empty()) result.factors[0] = static_cast<double>(timeUnitNamed(timeUnit));
  if (!columns.empty()) rename(result, columns);
  return result;
}

}  // namespace senseloom::tool
