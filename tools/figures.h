// Small drawings in a line of text, as SVG. What they show is in their titles as well.
#pragma once

#include <string>

#include "statistics.h"

namespace tool {

// Where a value lies between its bounds. `bounds`: "0 to 800 kN", as HTML.
std::string bounds_figure(double value, double min, double max, const std::string& bounds);

// `range`: what it covers, "-1.5 to 2.25", as HTML.
std::string histogram_figure(const Histogram& histogram, const std::string& range);

}  // namespace tool
