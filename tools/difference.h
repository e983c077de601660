// One difference between two parameter files.
#pragma once

#include <functional>
#include <optional>
#include <string>

namespace tool {

// Texts are visible. An element, parameter, column or row that only one file has lacks `before` or
// `after`.
struct Difference {
  std::string place;                         // "list 'Engine', parameter 'Thrust'"
  std::string what;                          // "value"; empty for the place as a whole
  std::optional<std::string> before, after;  // "480 kN"
};

using ReportDifference = std::function<void(const Difference&)>;

}  // namespace tool
