#include "sweep/sweep_plot.h"

#include <algorithm>
#include <cmath>
#include <set>
#include <string_view>
#include <vector>

#include "plot/svg_canvas.h"
#include "plot/svg_text.h"
#include "sweep/sweep_output.h"

namespace senseloom::tool {
namespace {

constexpr double kWidth = 1080;
constexpr double kMargin = 20;
constexpr double kLeft = 70;  // of the points
constexpr double kTop = 62;
constexpr double kPlotWidth = 600;
constexpr double kPlotHeight = 400;
constexpr double kLegendLeft = kLeft + kPlotWidth + 40;
constexpr double kLegendStride = 18;
constexpr size_t kMostNames = 22;
constexpr size_t kMostNameCharacters = 36;
constexpr int kMostMarks = 8;
constexpr double kHeadroom = 1.04;  // beyond the largest value

constexpr SvgColour kColours[] = {
    {".back", "fill", "#ffffff", "#0d1117"},  {"text", "fill", "#1f2328", "#e6edf3"},
    {".quiet", "fill", "#59636e", "#9198a1"}, {".axis", "stroke", "#d1d9e0", "#3d444d"},
    {".all", "stroke", "#4878b8", "#5c94dd"}, {".front", "stroke", "#d5504b", "#ee6a62"},
    {".best", "fill", "#d5504b", "#ee6a62"},  {".on", "fill", "#ffffff", "#0d1117"},
};
constexpr char kRules[] =
    ".axis,.front{fill:none}.front{stroke-width:1.6}.all{stroke-width:5;stroke-linecap:round;stroke-opacity:.55}"
    ".on{font-size:10px;font-weight:600}";

// The values of one figure along a side of the picture. Many small values stand beside a few large ones, so places go
// by the square root.
class Axis {
 public:
  Axis(double largest, double from, double length)
      : most(largest > 0 ? largest * kHeadroom : 1), start(from), extent(length) {}

  double at(double value) const { return start + extent * std::sqrt(value / most); }
  // Round values, not too close to each other.
  std::vector<double> marks() const {
    std::vector<double> values{0};
    const int highest = static_cast<int>(std::floor(std::log10(most)));
    for (int power = highest - 2; power <= highest; ++power) {
      for (const double factor : {1, 2, 5}) {
        const double value = factor * std::pow(10, power);
        const double room = std::abs(at(value) - at(values.back()));
        if (value <= most && room >= std::abs(extent) / (2 * kMostMarks)) values.push_back(value);
      }
    }
    return values;
  }

 private:
  double most;
  double start;
  double extent;  // negative: upwards
};

std::string markText(double value) {
  return value < 1 && value > 0 ? decimalText(value, value < 0.1 ? 2 : 1) : grouped(static_cast<uint64_t>(value));
}

class SweepPicture {
 public:
  explicit SweepPicture(const SweepOutcome& swept)
      : outcome(swept),
        front(frontOf(swept)),
        x(largest(swept.wait()), kLeft, kPlotWidth),
        y(largest(swept.bother()), kTop + kPlotHeight, -kPlotHeight) {}

  std::string draw(const std::string& title) {
    canvas.addText(kMargin, 32, "head", title);
    addAxes();
    addAll();
    addFront();
    const double legend = kTop + kLegendStride * static_cast<double>(named + (named < points ? 3 : 2));
    return canvas.document(title, kWidth, std::max(kTop + kPlotHeight + 62, legend + kMargin), kRules, kColours);
  }

 private:
  double largest(const FigureColumn& column) const {
    double most = 0;
    for (size_t row = 0; row < outcome.figures.size(); ++row) {
      if (outcome.isCompared(row)) most = std::max(most, outcome.figures[row].*column.figure);
    }
    return most;
  }

  double xOf(size_t row) const { return x.at(outcome.figures[row].*outcome.wait().figure); }
  double yOf(size_t row) const { return y.at(outcome.figures[row].*outcome.bother().figure); }

  void addAxes() {
    const double bottom = kTop + kPlotHeight;
    std::string lines = 'M' + coordinate(kLeft) + ' ' + coordinate(kTop) + 'V' + coordinate(bottom) + 'H' +
                        coordinate(kLeft + kPlotWidth);
    for (const double value : x.marks()) {
      lines += 'M' + coordinate(x.at(value)) + ' ' + coordinate(bottom) + "v5";
      canvas.addText(x.at(value), bottom + 18, "quiet small", markText(value), "middle");
    }
    for (const double value : y.marks()) {
      lines += 'M' + coordinate(kLeft) + ' ' + coordinate(y.at(value)) + 'h' + coordinate(kPlotWidth);
      canvas.addText(kLeft - 8, y.at(value) + 4, "quiet small", markText(value), "end");
    }
    canvas.addPath("axis", lines);
    canvas.addText(kMargin, kTop - 10, "small",
                   outcome.truthKnown ? "false reports an hour" : "reports an hour (what is true is not known)");
    canvas.addText(kLeft + kPlotWidth, bottom + 38, "small",
                   outcome.truthKnown ? "median delay in seconds"
                                      : "seconds from the first record of a batch to the result, median",
                   "end");
    canvas.addText(kMargin, bottom + 38, "quiet small", "both axes go by the square root");
  }

  void addAll() {
    std::set<std::string> places;
    size_t left = 0;
    for (size_t row = 0; row < outcome.figures.size(); ++row) {
      if (!outcome.isCompared(row)) ++left;
      if (outcome.isCompared(row)) places.insert('M' + coordinate(xOf(row)) + ' ' + coordinate(yOf(row)) + "h0");
    }
    std::string path;
    for (const std::string& place : places) path += place;
    if (left > 0) {
      canvas.addText(kLegendLeft, kTop + kPlotHeight, "quiet small",
                     "left out: " + grouped(left) + " (most changes missed, or a value replaced)");
    }
    canvas.addPath("all", path);
  }

  // Combinations with the same two figures are one point, with the name of the first.
  void addFront() {
    std::string line;
    std::string markers;
    addLegendHead();
    for (size_t i = 0; i < front.size();) {
      size_t next = i + 1;
      while (next < front.size() && isSamePoint(front[i], front[next])) ++next;
      line += (line.empty() ? 'M' : 'L') + coordinate(xOf(front[i])) + ' ' + coordinate(yOf(front[i]));
      ++points;
      if (named < kMostNames) addNamed(front[i], next - i - 1);
      i = next;
    }
    canvas.addPath("front", line);
    canvas.add(markerText);
    if (named < points) {
      canvas.addText(kLegendLeft, legendY(named), "quiet small", "and " + grouped(points - named) + " more");
    }
  }

  bool isSamePoint(size_t left, size_t right) const { return xOf(left) == xOf(right) && yOf(left) == yOf(right); }

  static double legendY(size_t line) { return kTop + 6 + kLegendStride * static_cast<double>(line + 1); }

  void addLegendHead() {
    canvas.addText(kLegendLeft, kTop, "name", "beaten by no other");
    canvas.addText(kWidth - kMargin - 60, kTop, "quiet small", outcome.truthKnown ? "false/h" : "reports/h", "end");
    canvas.addText(kWidth - kMargin, kTop, "quiet small", outcome.truthKnown ? "delay s" : "batch s", "end");
  }

  void addNamed(size_t row, size_t alike) {
    const Figures& figures = outcome.figures[row];
    const std::string number = std::to_string(++named);
    const double baseline = legendY(named - 1);
    addMarker(xOf(row), yOf(row), number);
    addMarker(kLegendLeft + 8, baseline - 4, number);
    std::string name = shortened(outcome.grid.name(row), kMostNameCharacters);
    if (alike > 0) name += " (+" + grouped(alike) + " alike)";
    canvas.addText(kLegendLeft + 24, baseline, "small", name);
    canvas.addText(kWidth - kMargin - 60, baseline, "small", decimalText(figures.*outcome.bother().figure, 1), "end");
    canvas.addText(kWidth - kMargin, baseline, "small", decimalText(figures.*outcome.wait().figure, 1), "end");
  }

  // Drawn after the line, so that it is above it.
  void addMarker(double centreX, double centreY, const std::string& number) {
    markerText += "<circle class=\"best\" cx=\"" + coordinate(centreX) + "\" cy=\"" + coordinate(centreY) +
                  "\" r=\"8\"/>\n<text x=\"" + coordinate(centreX) + "\" y=\"" + coordinate(centreY + 3.5) +
                  "\" class=\"on\" text-anchor=\"middle\">" + number + "</text>\n";
  }

  const SweepOutcome& outcome;
  const std::vector<size_t> front;
  const Axis x;
  const Axis y;
  SvgCanvas canvas;
  std::string markerText;
  size_t points = 0;  // of the front
  size_t named = 0;   // of these
};

}  // namespace

std::string drawSweep(const SweepOutcome& outcome, const std::string& title) {
  return SweepPicture(outcome).draw(title);
}

}  // namespace senseloom::tool
