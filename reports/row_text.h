// Formats rows and headings of tables as lines of text: values in the width of their columns, with
// two blanks between them.
//
// A column's definition and format are evaluated once, into a Cell; writing a row then uses the
// cells and does not parse formats again.
#pragma once

#include <cstdint>
#include <string_view>

#include "core/base/heap.h"
#include "tables/formats.h"
#include "tables/table.h"

extern "C" {

// Writes the fields of a row for the columns first..last of a table as text.
//   line        room for what the row needs: numbers at least their format's width, strings twice
//               their length and two more, two blanks between neighbours, and a terminator
//   length_out  receives the length of the text
//   PF_BADTYPE  the last column has no such value type; other columns without one are skipped
TEVPF_API TEVPF_STATUS TEV8R1_review_row(const TEVPF_COLUMN* first, const TEVPF_COLUMN* last,
                                         const void* row, char* line,
                                         std::int32_t* length_out) noexcept;
}

namespace tevpf {

// Dumps pad strings to the display width, except in the last column; listings pad to the declared
// width.
enum class StringPadding { kDump, kListing };

struct Cell {
  // Writes the value and returns the end of the text; chosen by type.
  char* (*write)(char* out, const char* value, const Cell& cell) noexcept;
  std::int32_t offset;       // of the value in the row
  std::int32_t width;        // minimum width of a value; for strings, of a non-empty one
  std::int32_t empty_width;  // strings: minimum width of the marker for an empty one
  std::int32_t precision;    // reals and doubles
  std::int32_t length;       // strings: maximum length
};

[[nodiscard]] Cell make_cell(const TEVPF_COLUMN& column, bool last, StringPadding padding) noexcept;

// The status of converting one of the column's values to text.
[[nodiscard]] TEVPF_STATUS conversion_status(const TEVPF_COLUMN& column) noexcept;

// A selection of columns, their heading and the lines of their rows.
class RowText {
 public:
  // Selects columns of a table: all of them, or `count` chosen ones. Returns false when out of
  // memory.
  [[nodiscard]] bool take_all(const TEVPF_TABLE& table) noexcept;
  [[nodiscard]] bool make_room(std::int32_t count) noexcept;
  void take(const TEVPF_COLUMN& column) noexcept { columns_[count_++] = &column; }

  std::int32_t count() const noexcept { return count_; }
  const TEVPF_COLUMN& column(std::int32_t n) const noexcept { return *columns_[n]; }

  // Makes the cells and the line buffer. Returns false when out of memory, or when the length of a
  // line could exceed 31 bits. After that, lines can be written; each replaces the previous one.
  [[nodiscard]] bool prepare(StringPadding padding) noexcept;
  void write_heading() noexcept;
  void write_row(const unsigned char* row) noexcept;

  std::string_view line() const noexcept {
    return {line_.get(), static_cast<std::size_t>(length_)};
  }

 private:
  Owned<const TEVPF_COLUMN*> columns_;
  Owned<Cell> cells_;
  Owned<char> line_;
  std::int32_t count_ = 0;
  std::int64_t length_ = 0;
};

}  // namespace tevpf
