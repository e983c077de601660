// Comma-separated values as RFC 4180 describes them: a header row, fields in quotes where they need
// them.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace tool {

struct CsvRecord {
  std::size_t line = 0;  // of its first character, from 1
  std::vector<std::string> fields;
};

// Reads records one after the other. Lines end with LF, CRLF or CR, the last one may have no end; a
// byte order mark in front and empty lines are skipped. Throws Failure, with the line number, at
// what is no CSV.
class CsvReader {
 public:
  // `text` and `name` (for messages) must outlive the reader.
  CsvReader(std::string_view text, std::string_view name);

  bool next(CsvRecord& record);  // false at the end

  // A Failure about a record: "data.csv, line 7: what".
  [[noreturn]] void fail(std::size_t line, const std::string& what) const;

 private:
  void read_field(std::string& field);
  void read_quoted(std::string& field);
  bool at_line_end() const;
  void skip_line_end();

  std::string_view text_, name_;
  std::size_t pos_ = 0, line_ = 1;
};

// Appends a field, in quotes where it needs them: an empty field that stands alone in its row does.
void append_csv(std::string& row, std::string_view field, bool alone = false);

}  // namespace tool
