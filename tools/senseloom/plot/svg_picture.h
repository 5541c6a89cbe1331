#pragma once

#include <string>
#include <vector>

#include "plot/plot.h"

namespace senseloom::tool {

// A plot as a self-contained SVG file, on a light or a dark ground as the viewer prefers. `names` are the names
// of the classes from 0 on, as far as they have any.
std::string drawSvg(const Plot& plot, const std::string& title, const std::vector<std::string>& names);

}  // namespace senseloom::tool
