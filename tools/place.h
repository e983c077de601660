// Where a parameter stands in its list, or a column in its table: --before, --after, --position.
#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

#include "definition_options.h"

namespace tool {

struct PlaceOptions {
  std::optional<std::string> before, after;  // names of others
  std::size_t position = 0;                  // counted from 1; 0: not given

  bool is_given() const { return before || after || position != 0; }
};

// How many of the others, in their order, stand in front of that place. `word`: "parameter".
std::size_t place_among(const std::vector<std::string>& others, const PlaceOptions& options,
                        const char* word, const Subject& subject);

// Moves a parameter, or a column, to the place.
void move_to(tevpf::List& list, const std::string& parameter, const PlaceOptions& options,
             const Subject& subject);
void move_to(tevpf::Table& table, const std::string& column, const PlaceOptions& options,
             const Subject& subject);

}  // namespace tool
