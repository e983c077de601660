#include "import_options.h"

#include <cstdint>
#include <limits>

#include "failure.h"
#include "names.h"
#include "text.h"
#include "values.h"

namespace tool {
namespace {

constexpr Type kTypes[] = {Type::int32, Type::int16, Type::float32, Type::float64, Type::string};

Type parse_type(const std::string& word) {
  if (const auto type = type_named(word)) return *type;
  throw Failure(kUsage, "--types: " + in_quotes(word) +
                            " is no type; types are integer, short, real, double and string");
}

// NAME=WHAT, parted at the sign.
std::pair<std::string, std::string> parted(const std::string& text, std::size_t sign,
                                           const char* option) {
  if (sign != std::string::npos && sign > 0) return {text.substr(0, sign), text.substr(sign + 1)};
  throw Failure(kUsage, std::string(option) + " " + in_quotes(text) + ": COLUMN=... is wanted");
}

void read_types(const std::vector<std::string>& given, ImportOptions& options) {
  for (const std::string& text : split_at_commas(given)) {
    const std::size_t sign = text.rfind('=');
    if (sign == std::string::npos) {
      options.type_of_others = parse_type(text);
    } else {
      auto [name, word] = parted(text, sign, "--types");
      options.types.set(std::move(name), parse_type(word));
    }
  }
}

void read_widths(const std::vector<std::string>& given, ImportOptions& options) {
  for (const std::string& text : split_at_commas(given)) {
    auto [name, digits] = parted(text, text.rfind('='), "--width");
    std::int32_t width = 0;
    constexpr std::int32_t kMost = std::numeric_limits<std::int32_t>::max() - 1;
    if (parse_number(digits, width) != Parsed::kValue || width < 1 || width > kMost) {
      throw Failure(kUsage, "--width " + in_quotes(text) +
                                ": a width is a number of bytes from 1 to " +
                                std::to_string(kMost));
    }
    options.widths.set(std::move(name), static_cast<std::size_t>(width));
  }
}

}  // namespace

std::optional<Type> type_named(std::string_view word) {
  for (const Type type : kTypes) {
    if (word == tevpf::to_string(type)) return type;
  }
  return std::nullopt;
}

ImportOptions import_options(const Arguments& arguments) {
  ImportOptions options;
  options.kind = arguments.kind();
  options.has_delimiter = !arguments.delimiter.empty();
  if (options.has_delimiter) options.dialect.delimiter = parse_delimiter(arguments.delimiter);
  options.dialect.comment = arguments.comment;
  options.dialect.skip = arguments.skip;
  options.has_header = !arguments.no_header;
  options.fills = arguments.fill;
  options.shortens_names = arguments.shorten_names;
  options.is_forced = arguments.force;
  options.columns = arguments.columns;
  options.rules.missing = arguments.missing;
  options.rules.has_decimal_comma = arguments.decimal_comma;
  read_types(arguments.types, options);
  read_widths(arguments.widths, options);
  for (const std::string& text : arguments.defaults) {
    auto [name, value] = parted(text, text.find('='), "--default");
    options.defaults.set(std::move(name), std::move(value));
  }
  return options;
}

}  // namespace tool
