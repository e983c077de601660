// What the fields of a CSV column have in common, and the column of a table that holds them all.
#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "tevpf.hpp"

namespace tool {

// What a field says beside its own text.
struct FieldRules {
  std::vector<std::string> missing;  // texts that stand for a missing value, beside the empty one
  bool has_decimal_comma = false;
  bool may_have_decimal_comma = false;  // the comma is no delimiter

  bool is_missing(std::string_view field) const;
  char point() const { return has_decimal_comma ? ',' : '.'; }
};

class ColumnShape {
 public:
  // Takes a field into account. `line`: its record's, for messages.
  void fit(std::string_view field, std::size_t line, const FieldRules& rules);

  tevpf::Type type() const;
  std::size_t longest() const { return longest_; }  // bytes of a text, at least 1
  std::size_t longest_line() const { return longest_line_; }

  // A column of that type that holds every field, a string of `width` bytes.
  tevpf::Column column(const std::string& name, tevpf::Type type, std::size_t width) const;

  // One text that is no number, alone of its kind among numbers, and the line where it came first.
  struct Stranger {
    std::string text;
    std::size_t line;
  };
  std::optional<Stranger> marker_among_numbers() const;
  std::optional<Stranger> not_utf8() const { return not_utf8_; }
  std::optional<Stranger> decimal_comma() const;  // every field is a number, some have such a comma

 private:
  void fit_number(std::string_view text, std::size_t line, const FieldRules& rules);
  void look_at_bytes(std::string_view field, std::size_t line);
  void fit_stranger(std::string_view text, std::size_t line, const FieldRules& rules);

  bool integers_ = true, numbers_ = true;  // of the fields that are not missing
  bool has_digits_ = false, has_missing_ = false, has_infinity_ = false;
  std::size_t longest_ = 1, longest_line_ = 0;
  int precision_ = 6;  // significant digits that show every number exactly

  std::optional<Stranger> not_utf8_;  // the first text that is not
  Stranger first_{};                  // of the fields that are no numbers
  bool are_alike_ = true;             // all of them are the first one
  bool are_comma_numbers_ = true;     // all of them are numbers with a decimal comma
};

}  // namespace tool
