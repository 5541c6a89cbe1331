#include "sweep/sweep_outcome.h"

#include <algorithm>
#include <cmath>
#include <numeric>
#include <tuple>

#include "sweep/option_check.h"
#include "sweep/sweep_output.h"

namespace senseloom::tool {
namespace {

// Within the limits, the client that hears of changes soonest is served best; if the delay is limited alone, it is the
// one that is told the fewest things that are false. Among equals, fewer changes missed and fewer results are better.
auto rankOf(const Figures& figures, const Limits& limits) {
  const double delay = figures.delayMedian;
  const double bother = figures.falseReports;
  return limits.falsePerHour ? std::tuple(delay, figures.missed, bother, figures.results)
                             : std::tuple(bother, figures.missed, delay, figures.results);
}

std::string limitText(const Limits& limits) {
  std::string text;
  if (limits.falsePerHour) text = "at most " + decimalText(*limits.falsePerHour, 1) + " false reports an hour";
  if (!limits.delay) return text;
  return text + (text.empty() ? "" : " and ") + "a median delay of at most " + decimalText(*limits.delay, 1) + " s";
}

std::string figuresText(const Figures& figures) {
  return decimalText(figures.falseReports, 1) + " false reports an hour, a median delay of " +
         decimalText(figures.delayMedian, 1) + " s, " + decimalText(figures.missed, 0) + " of " +
         decimalText(figures.changes, 0) + " changes missed, right for " + decimalText(100 * figures.right, 1) +
         " % of the time";
}

}  // namespace

const FigureColumn& SweepOutcome::bother() const {
  return figureNamed(truthKnown ? "false_per_hour" : "reports_per_hour");
}

const FigureColumn& SweepOutcome::wait() const {
  return figureNamed(truthKnown ? "delay_median_s" : "batch_median_s");
}

bool SweepOutcome::isCompared(size_t combination) const {
  const Figures& each = figures[combination];
  const bool hasBoth = !std::isnan(each.*wait().figure) && !std::isnan(each.*bother().figure);
  return hasBoth && !each.isReplaced && !(2 * each.missed > each.changes);
}

std::string SweepOutcome::option(size_t combination) const {
  return (heads.size() == 1 ? heads[0] : "{") + grid.members(combination) + '}';
}

std::vector<std::string> SweepOutcome::remarks(size_t combination) const {
  std::vector<std::string> all;
  for (const std::string& head : heads) {
    for (std::string& remark : remarksOn(sensor, head, grid, combination)) {
      if (std::ranges::find(all, remark) == all.end()) all.push_back(std::move(remark));
    }
  }
  return all;
}

std::vector<size_t> chooseRows(const SweepOutcome& outcome, const RowChoice& choice) {
  std::vector<size_t> rows(outcome.grid.size());
  std::iota(rows.begin(), rows.end(), size_t{0});
  if (choice.isFrontOnly) rows = frontOf(outcome);
  if (!choice.sortedBy.empty()) {
    const auto figure = figureNamed(choice.sortedBy).figure;
    std::ranges::stable_sort(rows, [&](size_t left, size_t right) {
      const double a = outcome.figures[left].*figure;
      const double b = outcome.figures[right].*figure;
      if (std::isnan(a) || std::isnan(b)) return !std::isnan(a);  // what is not known comes last
      return choice.isReversed ? a > b : a < b;
    });
  } else if (choice.isReversed) {
    std::ranges::reverse(rows);
  }
  if (choice.most && *choice.most < rows.size()) rows.resize(*choice.most);
  return rows;
}

std::vector<size_t> frontOf(const SweepOutcome& outcome) {
  const auto point = [&](size_t row) {
    const Figures& figures = outcome.figures[row];
    return std::pair(figures.*outcome.wait().figure, figures.*outcome.bother().figure);
  };
  std::vector<size_t> rows;
  for (size_t row = 0; row < outcome.figures.size(); ++row) {
    if (outcome.isCompared(row)) rows.push_back(row);
  }
  const auto rank = [&](size_t row) { return std::tuple(point(row), outcome.figures[row].results); };
  std::ranges::stable_sort(rows, [&](size_t left, size_t right) { return rank(left) < rank(right); });
  std::vector<size_t> front;
  for (const size_t row : rows) {
    const bool isBetter = front.empty() || point(row).second < point(front.back()).second;
    if (isBetter || point(row) == point(front.back())) front.push_back(row);
  }
  return front;
}

std::string recommendation(const SweepOutcome& outcome, const Limits& limits) {
  std::optional<size_t> best;
  for (size_t row = 0; row < outcome.figures.size(); ++row) {
    const Figures& figures = outcome.figures[row];
    if (!outcome.isCompared(row)) continue;
    if (limits.falsePerHour && figures.falseReports > *limits.falsePerHour) continue;
    if (limits.delay && figures.delayMedian > *limits.delay) continue;
    if (!best || rankOf(figures, limits) < rankOf(outcome.figures[*best], limits)) best = row;
  }
  if (!best) return "No combination has " + limitText(limits) + '.';
  return "With " + limitText(limits) + ", take " + outcome.option(*best) + ": " + figuresText(outcome.figures[*best]) +
         '.';
}

}  // namespace senseloom::tool
