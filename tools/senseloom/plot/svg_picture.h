#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "plot/plot.h"

namespace senseloom::tool {

// What a picture says beside its plot.
struct PictureHead {
  std::string title;
  std::vector<std::string> classNames;  // from class 0 on, as far as they have any
  int64_t timeUnit;                     // of the timestamps, in nanoseconds
};

// A plot as a self-contained SVG file, on a light or a dark ground as the viewer prefers.
std::string drawSvg(const Plot& plot, const PictureHead& head);

}  // namespace senseloom::tool
