#include "sweep/sweep_output.h"

#include <array>
#include <cmath>
#include <vector>

#include "terminal/text_table.h"
#include "trace/json.h"

namespace senseloom::tool {
namespace {

bool isShown(const FigureColumn& column, bool truthKnown) {
  return column.truth == FigureColumn::either || (column.truth == FigureColumn::known) == truthKnown;
}

std::string jsonNumber(double value) {
  if (std::isnan(value)) return "null";
  std::array<char, 32> text;
  std::snprintf(text.data(), text.size(), "%.10g", value);
  return text.data();
}

}  // namespace

std::string decimalText(double value, int decimals) {
  if (std::isnan(value)) return "-";
  std::array<char, 64> text;
  std::snprintf(text.data(), text.size(), "%.*f", decimals, value);
  return text.data();
}

void printSweepTable(std::FILE* out, const SweepOutcome& outcome, std::span<const size_t> rows) {
  if (rows.empty()) return;
  std::vector<TextRow> table(1);
  for (const SweepAxis& axis : outcome.grid.axes()) table[0].push_back(axis.key);
  for (const FigureColumn& column : figureColumns()) {
    if (isShown(column, outcome.truthKnown)) table[0].push_back(column.heading);
  }
  table[0].push_back("");
  for (const size_t row : rows) {
    TextRow cells;
    for (const int64_t value : outcome.grid.values(row)) cells.push_back(std::to_string(value));
    for (const FigureColumn& column : figureColumns()) {
      if (isShown(column, outcome.truthKnown)) {
        cells.push_back(decimalText(outcome.figures[row].*column.figure, column.decimals));
      }
    }
    cells.push_back(outcome.figures[row].isReplaced ? "!" : "");
    table.push_back(cells);
  }
  printTable(out, table, 0);
}

void printSweepJson(std::FILE* out, const SweepOutcome& outcome, std::span<const size_t> rows) {
  for (const size_t row : rows) {
    std::string line = "{\"option\":" + outcome.option(row);
    for (const FigureColumn& column : figureColumns()) {
      if (column.truth == FigureColumn::unknown && outcome.truthKnown) continue;
      line += std::string(",\"") + column.name + "\":" + jsonNumber(outcome.figures[row].*column.figure);
    }
    if (outcome.figures[row].isReplaced) {
      Json notes(json_array());
      for (const std::string& remark : outcome.remarks(row)) {
        json_array_append_new(notes.get(), json_string(remark.c_str()));
      }
      line += ",\"replaced\":" + compactText(notes.get());
    }
    std::fprintf(out, "%s}\n", line.c_str());
  }
}

}  // namespace senseloom::tool
