#include "sweep/truth_file.h"

#include <algorithm>
#include <cctype>
#include <charconv>

#include "input_error.h"
#include "trace/csv_reader.h"
#include "trace/time_unit.h"

namespace senseloom::tool {
namespace {

int32_t labelFrom(const std::string& text) {
  int32_t label = 0;
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), label);
  if (error != std::errc() || end != text.data() + text.size()) {
    throw InputError('"' + text + "\" is not the number of a class");
  }
  return label;
}

bool isHeading(const std::vector<std::string>& cells) {
  return cells[0].empty() || std::isdigit(static_cast<unsigned char>(cells[0][0])) == 0;
}

}  // namespace

TruthFile::TruthFile(const std::string& file, int64_t timeUnit) {
  CsvReader table(file);
  try {
    bool isFirst = true;
    for (auto cells = table.next(); !cells.empty(); cells = table.next()) {
      if (std::exchange(isFirst, false) && isHeading(cells)) continue;
      if (cells.size() != 2) throw InputError("must hold a time and a class");
      const int64_t time = timeFromText(cells[0], timeUnit);
      if (!rows.empty() && time < rows.back().first) throw InputError("the time is before that of the row above");
      rows.emplace_back(time, labelFrom(cells[1]));
    }
    if (rows.empty()) throw InputError("holds no truth");
  } catch (const InputError& error) {
    throw InputError(table.position() + ": " + error.what());
  }
}

int32_t TruthFile::labelAt(int64_t time) const {
  const auto after = std::upper_bound(rows.begin(), rows.end(), time,
                                      [](int64_t value, const auto& row) { return value < row.first; });
  return after == rows.begin() ? 0 : std::prev(after)->second;
}

}  // namespace senseloom::tool
