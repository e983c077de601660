#include "figures.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cmath>

#include "html.h"

namespace tool {
namespace {

constexpr double kWidth = 120;
constexpr double kBarHeight = 14, kMargin = 4;  // the margin is the mark's
constexpr double kBinHeight = 28, kGap = 1;

// A coordinate, in tenths of a pixel.
std::string px(double length) {
  std::array<char, 32> buffer;
  char* const end = std::to_chars(buffer.data(), buffer.data() + buffer.size(), length,
                                  std::chars_format::fixed, 1)
                        .ptr;
  std::string text(buffer.data(), end);
  if (text.ends_with(".0")) text.resize(text.size() - 2);
  return text;
}

std::string drawing(const char* look, double height, const std::string& title,
                    const std::string& shapes) {
  return html_tag(
             "svg",
             {{"class", look}, {"role", "img"}, {"width", px(kWidth)}, {"height", px(height)}}) +
         "<title>" + title + "</title>" + shapes + "</svg>";
}

std::string line(const char* look, double from, double to, double y) {
  return html_tag("path", {{"class", look}, {"d", "M" + px(from) + " " + px(y) + "H" + px(to)}}) +
         "</path>";
}

// One bar of a histogram, as a part of a path.
std::string upright(double left, double width, double height) {
  return "M" + px(left) + " " + px(kBinHeight - 1) + "v-" + px(height) + "h" + px(width) + "v" +
         px(height) + "z";
}

}  // namespace

std::string bounds_figure(double value, double min, double max, const std::string& bounds) {
  // Halves, because the range may be wider than the largest double.
  const double part = (value / 2 - min / 2) / (max / 2 - min / 2);
  const double left = kMargin, right = kWidth - kMargin, middle = kBarHeight / 2;
  const double place = left + std::clamp(part, 0.0, 1.0) * (right - left);
  return drawing(
      "bar", kBarHeight, std::to_string(std::lround(part * 100)) + " % of the way from " + bounds,
      line("track", left, right, middle) + line("part", left, place, middle) +
          html_tag("circle",
                   {{"class", "mark"}, {"cx", px(place)}, {"cy", px(middle)}, {"r", "3.5"}}) +
          "</circle>");
}

std::string histogram_figure(const Histogram& histogram, const std::string& range) {
  const std::vector<std::size_t>& counts = histogram.counts();
  const std::size_t most = *std::max_element(counts.begin(), counts.end());
  const double step = kWidth / static_cast<double>(counts.size());
  std::string shapes;
  for (std::size_t bin = 0; bin < counts.size(); ++bin) {
    if (counts[bin] == 0) continue;
    const double part = static_cast<double>(counts[bin]) / static_cast<double>(most);
    const double height = std::max(part * (kBinHeight - 2), 1.0);  // a pixel for a few
    shapes += upright(static_cast<double>(bin) * step, step - kGap, height);
  }
  const bool is_one = counts.size() == 1;
  const std::string title = range + (is_one ? "" : " in " + grouped(counts.size()) + " bins") +
                            ", at most " + counted_in_groups(most, "value") +
                            (is_one ? "" : " in one");
  return drawing("bins", kBinHeight, title,
                 html_tag("path", {{"class", "counts"}, {"d", shapes}}) + "</path>" +
                     line("floor", 0, kWidth, kBinHeight - 0.5));
}

}  // namespace tool
