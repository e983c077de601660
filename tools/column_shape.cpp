#include "column_shape.h"

#include <algorithm>
#include <cstdint>
#include <limits>

#include "number_text.h"
#include "text.h"
#include "values.h"

namespace tool {
namespace {

constexpr int kMostPrecision = 17;

}  // namespace

bool FieldRules::is_missing(std::string_view field) const {
  if (field.empty()) return true;
  if (missing.empty() && field.front() > ' ') return false;
  const std::string_view text = trimmed(field);
  return text.empty() || std::find(missing.begin(), missing.end(), text) != missing.end();
}

void ColumnShape::fit(std::string_view field, std::size_t line, const FieldRules& rules) {
  if (rules.is_missing(field)) {
    has_missing_ = true;
    if (trimmed(field).empty()) longest_ = std::max(longest_, field.size());  // blanks are a text
    return;
  }
  if (field.size() > longest_) {
    longest_ = field.size();
    longest_line_ = line;
  }
  if (!not_utf8_) look_at_bytes(field, line);
  if (numbers_ || are_alike_ || are_comma_numbers_) fit_number(trimmed(field), line, rules);
}

void ColumnShape::look_at_bytes(std::string_view field, std::size_t line) {
  const bool is_ascii = std::none_of(field.begin(), field.end(),
                                     [](char c) { return static_cast<unsigned char>(c) >= 0x80; });
  if (!is_ascii && !is_utf8(field)) not_utf8_ = {std::string(field), line};
}

void ColumnShape::fit_number(std::string_view text, std::size_t line, const FieldRules& rules) {
  const NumberText number = read_number_text(text, rules.point());
  if (!number.is_number) return fit_stranger(text, line, rules);
  has_infinity_ = has_infinity_ || number.is_infinity;
  if (!number.has_digits) {
    integers_ = false;
    return;
  }
  has_digits_ = true;
  integers_ = integers_ && number.is_integer;
  precision_ = std::clamp(number.precision, precision_, kMostPrecision);
}

void ColumnShape::fit_stranger(std::string_view text, std::size_t line, const FieldRules& rules) {
  if (numbers_) first_ = {std::string(text), line};
  numbers_ = false;
  are_alike_ = are_alike_ && text == first_.text;
  are_comma_numbers_ = are_comma_numbers_ && rules.may_have_decimal_comma &&
                       !rules.has_decimal_comma && read_number_text(text, ',').is_number;
}

tevpf::Type ColumnShape::type() const {
  if (!numbers_ || !has_digits_) return Type::string;
  return integers_ && !has_missing_ ? Type::int32 : Type::float64;
}

tevpf::Column ColumnShape::column(const std::string& name, tevpf::Type type,
                                  std::size_t width) const {
  tevpf::Column column(name, type);
  if (type == Type::string) column.width(static_cast<std::int32_t>(width));
  if (type == Type::float64) {
    column.precision(precision_).width(precision_ + 7);  // sign, point and exponent
  }
  if (is_floating(type) && has_infinity_) {
    static constexpr double kInfinity = std::numeric_limits<double>::infinity();
    column.bounds(-kInfinity, kInfinity);
  }
  return column;
}

std::optional<ColumnShape::Stranger> ColumnShape::marker_among_numbers() const {
  const bool has_digits = first_.text.find_first_of("0123456789") != std::string::npos;
  if (numbers_ || !has_digits_ || !are_alike_ || has_digits) return std::nullopt;
  return first_;
}

std::optional<ColumnShape::Stranger> ColumnShape::decimal_comma() const {
  if (numbers_ || !are_comma_numbers_) return std::nullopt;
  return first_;
}

}  // namespace tool
