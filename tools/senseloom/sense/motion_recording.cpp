#include "sense/motion_recording.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <cstdio>
#include <optional>
#include <string_view>

#include "input_error.h"
#include "resampler.h"
#include "trace/text_lines.h"

namespace senseloom::tool {
namespace {

using Row = MotionRecording::Row;

constexpr int64_t kSlowest = 51'000;      // microseconds from sample to sample: 20 a second, with some play
constexpr int64_t kMostBack = 1'000'000;  // that a row may be out of order, in microseconds
constexpr double kMostTime = 9e15;        // microseconds: 285 years

std::string quoted(const std::string& text) {
  return "column \"" + text + '"';
}

std::string decimal(double value) {
  std::array<char, 32> text;
  std::snprintf(text.data(), text.size(), "%.1f", value);
  return text.data();
}

std::string counted(size_t count, const std::string& thing) {
  return std::to_string(count) + ' ' + thing + (count == 1 ? "" : "s");
}

// The separator of a table, by its heading.
char separatorOf(const std::string& heading) {
  for (const char separator : {';', '\t'}) {
    if (heading.find(separator) != std::string::npos) return separator;
  }
  return ',';
}

std::vector<std::string_view> cellsOf(std::string_view line, char separator) {
  std::vector<std::string_view> cells;
  for (size_t from = 0; from <= line.size();) {
    const size_t to = std::min(line.find(separator, from), line.size());
    std::string_view cell = line.substr(from, to - from);
    const size_t first = cell.find_first_not_of(" \"");
    cell = first == std::string_view::npos ? "" : cell.substr(first, cell.find_last_not_of(" \"") - first + 1);
    cells.push_back(cell);
    from = to + 1;
  }
  return cells;
}

// Reads the rows of a recording as they are.
class RowReader {
 public:
  RowReader(const std::string& file, const RecordingColumns& namesAndUnits, bool rateIsNeeded)
      : columns(namesAndUnits), needsRate(rateIsNeeded), lines(file) {}

  std::vector<Row> read() {
    std::string line;
    try {
      if (!lines.next(line)) throw InputError("holds no recording");
      readHeading(line);
      std::vector<Row> rows;
      while (lines.next(line)) {
        if (line.find_first_not_of(" \t") != std::string::npos) rows.push_back(rowOf(line));
      }
      if (rows.empty()) throw InputError("holds a heading, but no samples");
      return rows;
    } catch (const InputError& error) {
      throw InputError(lines.position() + ": " + error.what());
    }
  }

 private:
  void readHeading(std::string_view line) {
    separator = separatorOf(std::string(line));
    const auto heading = cellsOf(line, separator);
    width = heading.size();
    for (size_t i = 0; i < kQuantities; ++i) {
      const auto found = std::ranges::find(heading, columns.names[i]);
      if (found != heading.end()) places[i] = static_cast<size_t>(found - heading.begin());
    }
    for (const Quantity quantity : {Quantity::time, Quantity::ax, Quantity::ay, Quantity::az}) require(quantity);
    hasRate = placeOf(Quantity::gx) && placeOf(Quantity::gy) && placeOf(Quantity::gz);
    if (needsRate) {
      for (const Quantity quantity : {Quantity::gx, Quantity::gy, Quantity::gz}) require(quantity);
    }
  }

  void require(Quantity quantity) const {
    if (placeOf(quantity)) return;
    const bool isRate = quantity >= Quantity::gx;
    throw InputError("no " + quoted(columns.nameOf(quantity)) +
                     (isRate ? ": a sensor that is asked for takes angular rates" : "") +
                     "; --columns says which is which");
  }

  std::optional<size_t> placeOf(Quantity quantity) const { return places[static_cast<size_t>(quantity)]; }

  Row rowOf(const std::string& line) {
    const auto cells = cellsOf(line, separator);
    if (cells.size() != width) {
      throw InputError(std::to_string(cells.size()) + " cells in a table of " + std::to_string(width));
    }
    Row row{};
    row.line = lines.lineNumber();
    row.sample.time = static_cast<int64_t>(number(cells, Quantity::time, kMostTime * 1000) / 1000);
    if (row.sample.time < 0) throw InputError(quoted(columns.nameOf(Quantity::time)) + " is negative");
    row.sample.acceleration = axes(cells, Quantity::ax);
    if (hasRate) row.sample.rate = axes(cells, Quantity::gx);
    if (placeOf(Quantity::pressure)) row.sample.pressure = integer(cells, Quantity::pressure);
    if (placeOf(Quantity::label)) row.label = integer(cells, Quantity::label);
    if (placeOf(Quantity::part)) row.part = partNamed(cells[*placeOf(Quantity::part)]);
    return row;
  }

  // Another name than in the row before begins another part.
  size_t partNamed(std::string_view name) {
    if (name != partName) ++parts;
    partName = name;
    return parts;
  }

  hub::Axes axes(const std::vector<std::string_view>& cells, Quantity first) const {
    hub::Axes result{};
    for (size_t i = 0; i < result.size(); ++i) {
      result[i] = integer(cells, static_cast<Quantity>(static_cast<size_t>(first) + i));
    }
    return result;
  }

  int32_t integer(const std::vector<std::string_view>& cells, Quantity quantity) const {
    return static_cast<int32_t>(number(cells, quantity, hub::kMostValue));
  }

  // Rounded, in the unit of the factors.
  double number(const std::vector<std::string_view>& cells, Quantity quantity, double most) const {
    const std::string_view cell = cells[*placeOf(quantity)];
    double value = 0;
    const auto [end, error] = std::from_chars(cell.data(), cell.data() + cell.size(), value);
    const bool isNumber = error == std::errc() && end == cell.data() + cell.size() && std::isfinite(value);
    const std::string where = quoted(columns.nameOf(quantity)) + ": \"" + std::string(cell) + '"';
    if (!isNumber) throw InputError(where + " is not a number");
    value = std::round(value * columns.factorOf(quantity));
    if (std::fabs(value) > most) throw InputError(where + " is more than a phone senses: see --units");
    return value;
  }

  const RecordingColumns& columns;
  const bool needsRate;
  TextLines lines;
  char separator = ',';
  size_t width = 0;
  std::array<std::optional<size_t>, kQuantities> places;
  bool hasRate = false;
  size_t parts = 0;
  std::string partName;
};

// Puts what was read into a form that a hub can take, and remembers what it had to do.
class Mender {
 public:
  Mender(const std::string& file, const RecordingColumns& names, bool rateIsNeeded, std::vector<Row> rows)
      : name(file == "-" ? "standard input" : file), columns(names), needsRate(rateIsNeeded) {
    recording.rows = std::move(rows);
  }

  MotionRecording mend() {
    putPartsApart();
    leaveOutZeros();
    putInOrder();
    checkRate();
    remarkOnGaps();
    return std::move(recording);
  }

 private:
  [[noreturn]] void fail(size_t line, Quantity quantity, const std::string& what) const {
    throw InputError(name + ':' + std::to_string(line) + ": " + quoted(columns.nameOf(quantity)) + what);
  }

  void remark(const std::string& text) { recording.remarks.push_back(name + ": " + text); }

  void putPartsApart() {
    auto& rows = recording.rows;
    int64_t shift = 0;
    int64_t latest = 0;
    for (size_t i = 0; i < rows.size(); ++i) {
      if (i > 0 && rows[i].part != rows[i - 1].part) shift = latest + kBetweenRecordings - rows[i].sample.time;
      rows[i].sample.time += shift;
      latest = std::max(latest, rows[i].sample.time);
    }
  }

  // Some phones deliver zeros until their sensors have begun. Not even a falling phone reads zero on all axes.
  void leaveOutZeros() {
    auto& rows = recording.rows;
    const size_t line = rows.front().line;
    const bool hasRates =
        std::ranges::any_of(rows, [](const Row& row) { return row.sample.rate.value_or(hub::Axes{}) != hub::Axes{}; });
    if (needsRate && !hasRates) fail(line, Quantity::gx, " is 0 from here on, and so are those of the other axes");
    const size_t left = std::erase_if(rows, [](const Row& row) { return row.sample.acceleration == hub::Axes{}; });
    if (rows.empty()) fail(line, Quantity::ax, " is 0 from here on, and so are those of the other axes");
    if (left > 0) remark(counted(left, "row") + " of zeros " + (left == 1 ? "is" : "are") + " left out");
  }

  void putInOrder() {
    auto& rows = recording.rows;
    size_t behind = 0;
    size_t equal = 0;
    int64_t latest = rows.front().sample.time;
    for (size_t i = 1; i < rows.size(); ++i) {
      const int64_t time = rows[i].sample.time;
      if (time < latest - kMostBack) {
        fail(rows[i].line, Quantity::time,
             ": " + decimal(static_cast<double>(latest - time) / 1e6) + " s before a row further up");
      }
      behind += time < latest ? 1 : 0;
      equal += time == latest ? 1 : 0;
      latest = std::max(latest, time);
    }
    if (behind > 0) {
      std::ranges::stable_sort(rows, {}, [](const Row& row) { return row.sample.time; });
      remark(counted(behind, "row") + " out of order " + (behind == 1 ? "is" : "are") + " put in order");
    }
    if (equal > 0)
      remark(counted(equal, "row") + " with the time of another " + (equal == 1 ? "is" : "are") + " left out");
  }

  void checkRate() {
    const auto& rows = recording.rows;
    if (rows.size() == 1) fail(rows.front().line, Quantity::time, ": a single sample is no recording");
    std::vector<int64_t> intervals;
    for (size_t i = 1; i < rows.size(); ++i) intervals.push_back(rows[i].sample.time - rows[i - 1].sample.time);
    const auto middle = intervals.begin() + static_cast<std::ptrdiff_t>(intervals.size() / 2);
    std::nth_element(intervals.begin(), middle, intervals.end());
    const int64_t median = std::max<int64_t>(*middle, 1);
    const std::string rate = decimal(1e6 / static_cast<double>(median)) + " samples a second";
    if (median > kSlowest) fail(rows[1].line, Quantity::time, ": " + rate + ", and at least 20 are needed");
    if (median != hub::kInterval) remark(rate + " become 50");
  }

  void remarkOnGaps() {
    size_t gaps = 0;
    int64_t longest = 0;
    for (size_t i = 1; i < recording.rows.size(); ++i) {
      const int64_t interval = recording.rows[i].sample.time - recording.rows[i - 1].sample.time;
      gaps += interval > hub::Resampler::kGap ? 1 : 0;
      longest = std::max(longest, interval);
    }
    if (gaps == 0) return;
    remark(counted(gaps, "gap") + " of up to " + decimal(static_cast<double>(longest) / 1e6) +
           " s: sensing starts over behind " + (gaps == 1 ? "it" : "each"));
  }

  const std::string name;
  const RecordingColumns& columns;
  const bool needsRate;
  MotionRecording recording;
};

}  // namespace

MotionRecording readMotionRecording(const std::string& file, const RecordingColumns& columns, bool needsRate) {
  return Mender(file, columns, needsRate, RowReader(file, columns, needsRate).read()).mend();
}

}  // namespace senseloom::tool
