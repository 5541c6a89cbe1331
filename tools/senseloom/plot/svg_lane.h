#pragma once

#include <array>
#include <string>

#include "plot/plot_lane.h"
#include "plot/record_hues.h"
#include "plot/timeline.h"

namespace senseloom::tool {

// The name of a hue's class in the style sheet of a picture.
std::string hueClass(size_t hue);

// The place of a lane in a picture.
struct SvgBox {
  double left;
  double top;
  double width;
  double height;
};

// Draws what a lane received: one path for each hue. A run of one class becomes one bar, and a bin with several classes
// a stack of their shares, the greatest at the bottom.
class SvgLane {
 public:
  SvgLane(const Timeline& timeline, const Sensor& shownSensor, const SvgBox& place)
      : time(timeline), sensor(shownSensor), box(place) {}

  // `most` is the greatest height, which fills the lane.
  std::string draw(const PlotLane& lane, uint32_t most);
  double xOf(size_t bin) const { return box.left + box.width * time.placeOf(bin); }

 private:
  struct Run {
    double from = 0;
    RecordHues content = {};
  };

  void drawLasting(const PlotLane& lane);
  void drawEvents(const PlotLane& lane, uint32_t most);
  void endRun(Run& run, double to);
  void addBar(size_t hue, double x, double width, double bottom, double height);

  const Timeline& time;
  const Sensor& sensor;
  const SvgBox box;
  std::array<std::string, kHues> paths;
};

}  // namespace senseloom::tool
