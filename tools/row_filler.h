// Turns the fields of records into the bytes of a table's rows.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "csv_header.h"
#include "find.h"
#include "tevpf.hpp"
#include "values.h"

namespace tool {

class RowFiller {
 public:
  // Columns that the CSV leaves out get what stands for a missing value; a Failure when there is no
  // such value. What is passed must outlive the filler.
  RowFiller(const tevpf::Table& table, const Columns& columns, const CsvHeader& header,
            const CsvReader& reader, const ImportOptions& options);

  // The row of a record: good until the next call. A Failure names the line, the column and what is
  // allowed there.
  const unsigned char* fill(const CsvRecord& record);

  // What the library refused: a value outside its bounds, or one that is there already.
  [[noreturn]] void refuse_row(const tevpf::Error& error, const CsvRecord& record) const;

  // Tells, when all rows are there, what they hold that the CSV does not say: values of columns that
  // it leaves out, and texts that were cut to --width.
  void tell_differences() const;

 private:
  // Where the values of a field go.
  struct Target {
    const tevpf::Column* column;
    std::size_t field;
    std::size_t offset, size;  // of a value in the row, a text's terminator included
    std::vector<unsigned char>
        missing;  // the bytes of a missing value; none: there is no such value
    bool may_cut = false;
    std::size_t cut = 0;  // texts so far
  };

  Target target(std::size_t column, std::size_t field) const;
  std::vector<unsigned char> missing_value(const Target& target) const;
  void leave_out(const Target& target);

  void fill_field(Target& target, std::string_view field, std::size_t line);
  void fill_text(Target& target, std::string_view text, std::size_t line);
  void fill_number(const Target& target, std::string_view text, std::size_t line);
  [[noreturn]] void refuse(const Target& target, std::size_t line, const std::string& why) const;

  std::string table_name_;
  const Columns& columns_;
  const CsvReader& reader_;
  const ImportOptions& options_;
  std::vector<std::size_t> offsets_;  // of all columns
  std::vector<unsigned char> row_;
  std::vector<Target> targets_;
  std::vector<std::string> differences_;
};

}  // namespace tool
