// Rows and headings of tables as lines of text: values in the width of their columns, two blanks
// between them.
//
// How a column's values look is worked out once, from its definition and its format, into a Cell;
// writing a row then follows the cells without looking at formats again.
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
//   PF_BADTYPE  the last column has no such value type; others of that kind are left out
TEVPF_API TEVPF_STATUS TEV8R1_review_row(const TEVPF_COLUMN* first, const TEVPF_COLUMN* last,
                                         const void* row, char* line,
                                         std::int32_t* length_out) noexcept;
}

namespace tevpf {

// Dumps pad strings to the display width, but for the last column; listings pad to the declared
// width.
enum class StringPadding { kDump, kListing };

struct Cell {
  // Writes the value and gives the end of the text; chosen by type.
  char* (*write)(char* out, const char* value, const Cell& cell) noexcept;
  std::int32_t offset;       // of the value in the row
  std::int32_t width;        // that a value is padded to; strings: one that is not empty
  std::int32_t empty_width;  // strings: what the marker of an empty one is padded to
  std::int32_t precision;    // reals and doubles
  std::int32_t length;       // strings: the longest
};

[[nodiscard]] Cell make_cell(const TEVPF_COLUMN& column, bool last, StringPadding padding) noexcept;

// The status of converting one of the column's values to text.
[[nodiscard]] TEVPF_STATUS conversion_status(const TEVPF_COLUMN& column) noexcept;

// A choice of columns, the heading above them and the lines of their rows.
class RowText {
 public:
  // Takes the columns of a table, all of them or `count` chosen ones; false when memory runs out.
  [[nodiscard]] bool take_all(const TEVPF_TABLE& table) noexcept;
  [[nodiscard]] bool make_room(std::int32_t count) noexcept;
  void take(const TEVPF_COLUMN& column) noexcept { columns_[count_++] = &column; }

  std::int32_t count() const noexcept { return count_; }
  const TEVPF_COLUMN& column(std::int32_t n) const noexcept { return *columns_[n]; }

  // Makes the cells and the buffer for the lines; false when memory runs out, or when a line could
  // take more than 31 bits. Then lines can be written, each replacing the one before.
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
