#include "plot/svg_lane.h"

#include <algorithm>
#include <numeric>
#include <utility>

#include "plot/svg_text.h"

namespace senseloom::tool {
namespace {

constexpr double kWidestEvent = 7;
constexpr double kNarrowestEvent = 1;
constexpr double kGap = 0.6;
constexpr double kLowestShare = 0.06;  // of a lane's height

// The hue of a content that has only one; kHues if there are several.
size_t onlyHue(const RecordHues& content) {
  const auto& counts = content.counts;
  const auto* first = std::find_if(counts.begin(), counts.end(), [](uint32_t count) { return count > 0; });
  const bool isOnly =
      first != counts.end() && std::all_of(first + 1, counts.end(), [](uint32_t count) { return count == 0; });
  return isOnly ? static_cast<size_t>(first - counts.begin()) : kHues;
}

}  // namespace

std::string hueClass(size_t hue) {
  return std::string("h").append(std::to_string(hue));
}

std::string SvgLane::draw(const PlotLane& lane, uint32_t most) {
  if (sensor.lasts) {
    drawLasting(lane);
  } else {
    drawEvents(lane, most);
  }
  std::string text;
  for (size_t hue = 0; hue < kHues; ++hue) {
    if (!paths[hue].empty()) text += "<path class=\"" + hueClass(hue) + "\" d=\"" + paths[hue] + "\"/>\n";
  }
  return text.empty() ? text : "<g shape-rendering=\"crispEdges\">\n" + text + "</g>\n";
}

void SvgLane::drawLasting(const PlotLane& lane) {
  Run run;
  const auto show = [&](double from, const RecordHues& content) {
    const size_t hue = onlyHue(content);
    if (run.content.records > 0 && hue != kHues && onlyHue(run.content) == hue) return;
    endRun(run, from);
    run = {from, content};
  };
  for (size_t bin = 0; bin < Timeline::kPlaces; ++bin) {
    const PlotLane::Bin& here = lane.at(bin);
    if (here.presence != PlotLane::Presence::same) endRun(run, xOf(bin));
    if (here.received.records == 0 || here.presence == PlotLane::Presence::closes) continue;
    show(xOf(bin), here.received);
    // The last of several records is what holds from then on.
    if (here.received.records > 1) show(xOf(bin + 1), here.last);
  }
  endRun(run, box.left + box.width);
}

void SvgLane::endRun(Run& run, double to) {
  const RecordHues content = std::exchange(run.content, {});
  const uint32_t total = std::accumulate(content.counts.begin(), content.counts.end(), uint32_t{0});
  if (total == 0 || to <= run.from) return;
  std::array<size_t, kHues> order;
  std::iota(order.begin(), order.end(), size_t{0});
  std::stable_sort(order.begin(), order.end(),
                   [&content](size_t left, size_t right) { return content.counts[left] > content.counts[right]; });
  double bottom = 0;
  for (const size_t hue : order) {
    const double height = box.height * content.counts[hue] / total;
    if (height > 0) addBar(hue, run.from, to - run.from, bottom, height);
    bottom += height;
  }
}

void SvgLane::drawEvents(const PlotLane& lane, uint32_t most) {
  for (size_t bin = 0; bin < Timeline::kBins; ++bin) {
    const RecordHues& content = lane.at(bin).received;
    if (content.records == 0) continue;
    const double x = xOf(bin);
    const double width = std::clamp(xOf(bin + 1) - x - kGap, kNarrowestEvent, kWidestEvent);
    double share = 1;
    if (sensor.shown == Shown::amount)
      share = most == 0 ? kLowestShare : std::max(kLowestShare, double{1} * content.height / most);
    const uint32_t total = std::accumulate(content.counts.begin(), content.counts.end(), uint32_t{0});
    double bottom = 0;
    for (size_t hue = 0; hue < kHues; ++hue) {
      if (content.counts[hue] == 0) continue;
      const double height = box.height * share * content.counts[hue] / total;
      addBar(hue, x, width, bottom, height);
      bottom += height;
    }
  }
}

// The coordinates of all four sides are rounded, not the lengths, so that neighbouring bars share a border.
void SvgLane::addBar(size_t hue, double x, double width, double bottom, double height) {
  const double base = box.top + box.height - bottom;
  paths[hue] += 'M' + coordinate(x) + ' ' + coordinate(base) + 'H' + coordinate(x + width) + 'V' +
                coordinate(base - height) + 'H' + coordinate(x) + 'z';
}

}  // namespace senseloom::tool
