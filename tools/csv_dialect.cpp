#include "csv_dialect.h"

#include <algorithm>
#include <array>

#include "failure.h"
#include "text.h"

namespace tool {

char parse_delimiter(const std::string& text) {
  if (text == "comma") return ',';
  if (text == "semicolon") return ';';
  if (text == "tab" || text == "\\t") return '\t';
  if (text.size() == 1 && text.find_first_of("\"\r\n") == std::string::npos) return text[0];
  throw Failure(kUsage, "--delimiter " + in_quotes(text) +
                            " is none; give one character, or comma, semicolon or tab");
}

std::optional<char> recognised_delimiter(std::string_view line, bool has_decimal_comma) {
  static constexpr std::string_view kDelimiters = "\t;|";
  std::array<std::size_t, kDelimiters.size()> counts{};
  bool is_quoted = false;
  for (const char byte : line) {
    if (byte == '"') is_quoted = !is_quoted;
    if (is_quoted) continue;
    if (byte == ',' && !has_decimal_comma) return std::nullopt;
    const std::size_t which = kDelimiters.find(byte);
    if (which != std::string_view::npos) ++counts[which];
  }
  const auto* const most = std::max_element(counts.begin(), counts.end());
  if (*most == 0 || std::count(counts.begin(), counts.end(), *most) > 1) return std::nullopt;
  return kDelimiters[static_cast<std::size_t>(most - counts.begin())];
}

std::string delimiter_words(char delimiter) {
  switch (delimiter) {
    case ',':
      return "commas";
    case '\t':
      return "tabs";
    case ';':
      return "semicolons";
    default:
      return in_quotes({&delimiter, 1});
  }
}

}  // namespace tool
