#include "place.h"

#include <algorithm>

#include "text.h"

namespace tool {
namespace {

template <class Range>
std::vector<std::string> names_of(const Range& definitions, const std::string& moved) {
  std::vector<std::string> names;
  for (const auto& definition : definitions) {
    if (definition.name() != moved) names.push_back(definition.name());
  }
  return names;
}

}  // namespace

std::size_t place_among(const std::vector<std::string>& others, const PlaceOptions& options,
                        const char* word, const Subject& subject) {
  if (options.position != 0) {
    if (options.position <= others.size() + 1) return options.position - 1;
    subject.refuse("there is no position " + std::to_string(options.position) +
                   "; the last one is " + std::to_string(others.size() + 1));
  }
  const std::string& name = options.before ? *options.before : *options.after;
  const auto found = std::find(others.begin(), others.end(), name);
  if (found == others.end()) {
    subject.refuse(std::string("there is no other ") + word + " " + in_quotes(name) +
                   did_you_mean(name, others));
  }
  return static_cast<std::size_t>(found - others.begin()) + (options.before ? 0 : 1);
}

void move_to(tevpf::List& list, const std::string& parameter, const PlaceOptions& options,
             const Subject& subject) {
  list.move(parameter, place_among(names_of(list, parameter), options, "parameter", subject));
}

void move_to(tevpf::Table& table, const std::string& column, const PlaceOptions& options,
             const Subject& subject) {
  const std::vector<std::string> others = names_of(table.columns(), column);
  const std::size_t place = place_among(others, options, "column", subject);
  if (place == others.size()) {
    table.move_column_to_end(column);
  } else {
    table.move_column(column, others[place]);
  }
}

}  // namespace tool
