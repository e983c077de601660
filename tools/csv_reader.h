// Records of comma-separated values as RFC 4180 describes them, read in place: fields in quotes where
// they need them, another delimiter where the dialect says so.
#pragma once

#include <array>
#include <cstddef>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "csv_dialect.h"
#include "csv_source.h"

namespace tool {

struct CsvField {
  std::string_view text;
  bool is_quoted = false;
  bool has_doubled_quotes = false;  // only while it is read
};

struct CsvRecord {
  std::size_t line = 0;  // of its first character, from 1
  std::vector<CsvField> fields;
};

// Reads records one after the other. Lines end with LF, CRLF or CR, the last one may have no end; a
// byte order mark in front is skipped. Throws Failure, with the line number, at what is no CSV.
class CsvReader {
 public:
  // The source must outlive the reader.
  CsvReader(CsvSource& source, const CsvDialect& dialect);

  // The next record; false at the end. Its fields are good until the next call. Empty lines are left
  // out, until they are asked for: as records of one empty field.
  bool next(CsvRecord& record);
  void read_empty_lines(bool on) { reads_empty_lines_ = on; }

  // The line that the next record starts with, without its end: good until the next call.
  std::string_view peek_line();
  std::size_t count_fields();  // of the next record; 0: there is none
  bool skip_line();            // false at the end

  char delimiter() const { return delimiter_; }
  void set_delimiter(char delimiter);

  const CsvSource& source() const { return source_; }

  // A Failure about a record: "data.csv, line 7: what".
  [[noreturn]] void fail(std::size_t line, const std::string& what) const;

 private:
  bool find_record();
  bool parse(CsvRecord& record);
  char* parse_field(char* p, CsvField& field);
  char* parse_quoted(char* p, CsvField& field);
  void finish(CsvRecord& record);
  [[noreturn]] void refuse_byte(const char* p, const CsvField& field) const;
  std::size_t line_at(const char* p) const;

  void skip_start();
  bool at_comment();
  bool has(std::size_t bytes);
  void read_more();

  CsvSource& source_;
  std::string comment_;
  char delimiter_ = ',';
  std::array<bool, 256> ends_field_{};
  bool reads_empty_lines_ = false;

  std::unique_ptr<char[]> buffer_;
  std::size_t room_ = 0;                  // of the buffer, without the zero byte behind its end
  char *pos_ = nullptr, *end_ = nullptr;  // what is not read yet; *end_ is 0
  bool at_eof_ = false;                   // nothing comes behind end_
  char* next_pos_ = nullptr;              // behind the record that was parsed
  bool has_quotes_ = false;               // in that record
  std::size_t line_ = 1;
};

}  // namespace tool
