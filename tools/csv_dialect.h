// How a CSV text is written: what stands between its fields, and what in it is no record.
#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>

namespace tool {

struct CsvDialect {
  char delimiter = ',';
  std::string comment;   // lines that start so are left out; empty: none are
  std::size_t skip = 0;  // lines in front that are no CSV
};

// What --delimiter says: one character, or "comma", "semicolon" or "tab". A Failure when it is none.
char parse_delimiter(const std::string& text);

// The tab, the semicolon or the bar of which a first line has most; none where it has commas outside
// quotes, unless those are in numbers.
std::optional<char> recognised_delimiter(std::string_view line, bool has_decimal_comma);

// "commas", "tabs" or "'|'".
std::string delimiter_words(char delimiter);

}  // namespace tool
