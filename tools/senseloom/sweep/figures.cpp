#include "sweep/figures.h"

#include <string>

#include "input_error.h"

namespace senseloom::tool {
namespace {

constexpr FigureColumn kColumns[] = {
    {"results_per_hour", "results/h", 1, &Figures::results, FigureColumn::either},
    {"reports_per_hour", "reports/h", 1, &Figures::reports, FigureColumn::either},
    {"no_majority_per_hour", "no majority/h", 1, &Figures::noMajority, FigureColumn::either},
    {"false_per_hour", "false/h", 1, &Figures::falseReports, FigureColumn::known},
    {"changes", "changes", 0, &Figures::changes, FigureColumn::known},
    {"missed", "missed", 0, &Figures::missed, FigureColumn::known},
    {"delay_median_s", "delay s", 1, &Figures::delayMedian, FigureColumn::known},
    {"delay_p90_s", "90 % s", 1, &Figures::delayP90, FigureColumn::known},
    {"right", "right", 3, &Figures::right, FigureColumn::known},
    {"batch_median_s", "batch s", 1, &Figures::batchMedian, FigureColumn::unknown},
};

}  // namespace

std::span<const FigureColumn> figureColumns() {
  return kColumns;
}

const FigureColumn& figureNamed(std::string_view name) {
  std::string known;
  for (const FigureColumn& column : kColumns) {
    if (name == column.name) return column;
    known += (known.empty() ? "" : ", ") + std::string(column.name);
  }
  throw InputError("no figure \"" + std::string(name) + "\": " + known + " are known");
}

}  // namespace senseloom::tool
