// The options that define a parameter or a column, the same ones for every command that does.
#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "failure.h"
#include "tevpf.hpp"
#include "values.h"

namespace tool {

// As the command line gives them; none: not given.
struct DefinitionOptions {
  std::optional<std::string> type, units, min, max, description;
  std::optional<std::int32_t> precision;
  std::optional<std::int32_t> width;  // columns alone have these
  std::optional<bool> index, unique;
  std::optional<std::string> default_value;

  bool defines_anything() const { return defines_parameter() || defines_column_only(); }
  bool defines_parameter() const { return type || units || min || max || description || precision; }
  bool defines_column_only() const { return width || index || unique || default_value; }
};

// What a definition or a value is for, as refusals name it.
struct Subject {
  std::string name;     // "engine.pf: 'Thrust' of list 'Engine'"
  std::string outcome;  // "is not added"

  [[noreturn]] void refuse(const std::string& why) const {
    throw Failure(kRefused, name + " " + outcome + ": " + why);
  }
};

// The type that a word names: those of the library's messages, or the usual ones of programs.
Type required_type(const std::string& word);

// The definition of a parameter. `before`: the one that is changed, none for a new one, which needs
// a value. Texts of numbers are read as the parameter's type, which is guessed when it is not given.
tevpf::Parameter define_parameter(const std::string& name, const tevpf::Parameter* before,
                                  const std::optional<std::string>& value,
                                  const DefinitionOptions& options, const Subject& subject);

// The same of a column.
tevpf::Column define_column(const std::string& name, const tevpf::Column* before,
                            const DefinitionOptions& options, const Subject& subject);

// Reads a value of a parameter or of a column, within its bounds.
template <class Definition>
Value value_within(const Definition& definition, const std::string& text, const Subject& subject) {
  Value value;
  const Parsed parsed = parse_value(definition.type(), text, value);
  if (parsed != Parsed::kValue) subject.refuse(refused_value(text, parsed, definition));
  if (!is_within(value, definition.bounds())) {
    subject.refuse(refused_value(text, Parsed::kOutOfRange, definition));
  }
  return value;
}

}  // namespace tool
