// What is different in two parameter files.
#pragma once

#include <functional>
#include <optional>
#include <string>

#include "tevpf.hpp"

namespace tool {

// Texts are visible. An element, parameter, column or row that only one file has lacks `before` or
// `after`.
struct Difference {
  std::string place;                         // "list 'Engine', parameter 'Thrust'"
  std::string what;                          // "value"; empty for the place as a whole
  std::optional<std::string> before, after;  // "480 kN"
};

// Elements, definitions, values of parameters, rows. Rows are matched by the first column that is
// unique in both files, else by their numbers.
void compare(const tevpf::File& before, const tevpf::File& after,
             const std::function<void(const Difference&)>& report);

}  // namespace tool
