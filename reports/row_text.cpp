#include "reports/row_text.h"

#include <algorithm>
#include <cstring>

#include "core/base/number_text.h"
#include "core/base/status.h"
#include "reports/display.h"
#include "reports/escape.h"
#include "reports/text_out.h"
#include "tables/directory.h"
#include "values/value_type.h"

namespace tevpf {

namespace {

// ---- Reading a column's format

// Reads an optional minus sign and digits; saturates on overflow.
std::int32_t read_number(const char*& at, const char* end) noexcept {
  const bool negative = at != end && *at == '-';
  if (negative) ++at;
  std::int64_t number = 0;
  for (; at != end && *at >= '0' && *at <= '9'; ++at) {
    number = std::min<std::int64_t>(number * 10 + (*at - '0'), INT32_MAX);
  }
  return static_cast<std::int32_t>(negative ? -number : number);
}

struct Format {
  std::int32_t width;
  std::int32_t precision;
};

// The width and precision in a column's format: "%12d", "%12.4g" or "%-12s". The format may be
// older than the definition. A column without a format gets its width and precision from the
// definition.
Format read_format(const TEVPF_COLUMN& column) noexcept {
  Format format = {display_width(column), kDefaultPrecision};
  if (column.def.type == PF_TYPE_REAL) format.precision = column.def.limits.f32.precision;
  if (column.def.type == PF_TYPE_DOUBLE) format.precision = column.def.limits.f64.precision;
  if (column.format[0] != '%') return format;
  const char* at = column.format + 1;
  const char* const end = column.format + sizeof column.format;
  format.width = read_number(at, end);
  if (format.width < 0) format.width = -format.width;
  if (at != end && *at == '.') format.precision = read_number(++at, end);
  return format;
}

// ---- Cells by type

// Right-aligns the text from `begin` to `end` in a field of that width.
char* align_right(char* begin, char* end, std::int32_t width) noexcept {
  const std::int64_t blanks = width - (end - begin);
  if (blanks <= 0) return end;
  std::memmove(begin + blanks, begin, static_cast<std::size_t>(end - begin));
  std::memset(begin, ' ', static_cast<std::size_t>(blanks));
  return end + blanks;
}

char* align_left(const char* begin, char* end, std::int32_t width) noexcept {
  const std::int64_t blanks = width - (end - begin);
  if (blanks <= 0) return end;
  std::memset(end, ' ', static_cast<std::size_t>(blanks));
  return end + blanks;
}

char* write_marker(char* out) noexcept {
  *out++ = '\\';
  *out++ = '0';
  return out;
}

template <class T>
char* write_number_cell(char* out, const char* value, const Cell& cell) noexcept {
  char* end;
  if constexpr (kIsFloating<T>) {
    end = write_general(out, load<T>(value), cell.precision);
  } else {
    end = write_decimal(out, load<T>(value));
  }
  return align_right(out, end, cell.width);
}

// Writes a marker for an empty text, and after a text that ends in white space, so that the white
// space can be seen.
char* write_string_cell(char* out, const char* value, const Cell& cell) noexcept {
  const std::size_t length = strnlen(value, static_cast<std::size_t>(cell.length));
  if (length == 0) return align_left(out, write_marker(out), cell.empty_width);
  char* end = write_escaped(out, value, static_cast<std::int64_t>(length));
  if (is_white(end[-1])) end = write_marker(end);
  return align_left(out, end, cell.width);
}

char* write_nothing(char* out, const char*, const Cell&) noexcept { return out; }

// The maximum number of characters in a cell.
std::int64_t cell_room(const Cell& cell, std::int32_t type) noexcept {
  const std::int64_t padded = std::max(cell.width, cell.empty_width);
  if (type == PF_TYPE_STRING) return std::max(2 * std::int64_t{cell.length} + 2, padded);
  if (!is_floating_type(type)) return std::max<std::int64_t>(padded, 24);
  const bool usual = cell.precision >= 0 && cell.precision <= kMaxPrecision;
  const std::int32_t digits = usual ? cell.precision : kMaxPrecision;
  return std::max<std::int64_t>(padded, digits + (kMaxNumberText - kMaxPrecision));
}

// ---- Headings

std::int32_t heading_lead(const TEVPF_COLUMN& column) noexcept {
  const auto length = static_cast<std::int32_t>(field_text(column.def.name).size());
  return (display_width(column) - length) / 2;
}

// Writes the names of `count` columns over blanks, each centred in its display width; returns the
// length of the heading.
template <class ColumnAt>
std::int64_t write_names(char* line, std::int32_t count, std::int32_t gap,
                         ColumnAt column_at) noexcept {
  std::int64_t start = 0;
  std::int64_t end = 0;
  for (std::int32_t n = 0; n < count; ++n) {
    const TEVPF_COLUMN& column = column_at(n);
    const std::size_t length = field_text(column.def.name).size();
    const std::int64_t place = start + heading_lead(column);
    std::memset(line + end, ' ', static_cast<std::size_t>(place - end));
    std::memcpy(line + place, column.def.name, length);
    end = place + static_cast<std::int64_t>(length);
    start += std::int64_t{display_width(column)} + gap;
  }
  line[end] = '\0';
  return end;
}

}  // namespace

Cell make_cell(const TEVPF_COLUMN& column, bool last, StringPadding padding) noexcept {
  const Format format = read_format(column);
  Cell cell = {write_nothing, column.offset, format.width, 0, format.precision, 0};
  if (is_number_type(column.def.type)) {
    with_number(column.def.type, [&](auto tag) { cell.write = write_number_cell<decltype(tag)>; });
  } else if (column.def.type == PF_TYPE_STRING) {
    cell.write = write_string_cell;
    cell.length = std::max(column.def.width, 0);
    if (padding == StringPadding::kListing) {
      cell.width = cell.empty_width = column.def.width;
    } else {
      cell.width = last ? 0 : display_width(column);
      cell.empty_width = format.width;
    }
  }
  return cell;
}

TEVPF_STATUS conversion_status(const TEVPF_COLUMN& column) noexcept {
  if (is_value_type(column.def.type)) return PF_NORMAL;
  return fail(PF_BADTYPE, "value", Text(column.def.type));
}

bool RowText::make_room(std::int32_t count) noexcept {
  columns_ = new_array<const TEVPF_COLUMN*>(static_cast<std::uint64_t>(count));
  return columns_ != nullptr;
}

bool RowText::take_all(const TEVPF_TABLE& table) noexcept {
  if (!make_room(table.num_cols)) return false;
  for (std::int32_t n = 0; n < table.num_cols; ++n) take(table.col_array[n]);
  return true;
}

bool RowText::prepare(StringPadding padding) noexcept {
  cells_ = new_array<Cell>(static_cast<std::uint64_t>(count_));
  if (!cells_) return false;
  std::int64_t room = 1;
  for (std::int32_t n = 0; n < count_; ++n) {
    cells_[n] = make_cell(column(n), n + 1 == count_, padding);
    const std::int64_t heading = display_width(column(n));
    room += std::max(cell_room(cells_[n], column(n).def.type), heading) + kColumnGap;
    if (room > INT32_MAX) return false;
  }
  line_ = new_array<char>(static_cast<std::uint64_t>(room));
  return line_ != nullptr;
}

void RowText::write_heading() noexcept {
  const auto column_at = [this](std::int32_t n) -> const TEVPF_COLUMN& { return column(n); };
  length_ = write_names(line_.get(), count_, kColumnGap, column_at);
}

void RowText::write_row(const unsigned char* row) noexcept {
  const char* const values = reinterpret_cast<const char*>(row);
  char* end = line_.get();
  for (std::int32_t n = 0; n < count_; ++n) {
    if (n > 0) {
      *end++ = ' ';
      *end++ = ' ';
    }
    const Cell& cell = cells_[n];
    end = cell.write(end, values + cell.offset, cell);
  }
  length_ = end - line_.get();
}

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_review_row(const TEVPF_COLUMN* first, const TEVPF_COLUMN* last, const void* row,
                               char* line, std::int32_t* length_out) noexcept {
  TEVPF_STATUS status = PF_NORMAL;
  char* end = line;
  for (const TEVPF_COLUMN* column = first; column <= last; ++column) {
    const Cell cell = make_cell(*column, column == last, StringPadding::kDump);
    end = cell.write(end, static_cast<const char*>(row) + cell.offset, cell);
    if (column != last) end = static_cast<char*>(std::memset(end, ' ', kColumnGap)) + kColumnGap;
    status = conversion_status(*column);
  }
  *end = '\0';
  *length_out = static_cast<std::int32_t>(end - line);
  return status;
}

TEVPF_STATUS TEV8R1_create_table_header(const char* table_name, std::int32_t first,
                                        std::int32_t last, std::int32_t gap,
                                        std::int32_t fill_width, std::int32_t* first_lead,
                                        char* buffer) noexcept {
  TEVPF_TABLE* table = nullptr;
  PF_TRY(find_table(table_name, table));
  first = std::max(first, 0);
  last = std::min(last, table->num_cols - 1);
  if (fill_width > 0) std::memset(buffer, ' ', static_cast<std::size_t>(fill_width));
  *first_lead = first <= last ? heading_lead(table->col_array[first]) : 0;
  const auto column_at = [&](std::int32_t n) -> const TEVPF_COLUMN& {
    return table->col_array[first + n];
  };
  write_names(buffer, std::max(last - first + 1, 0), std::max(gap, 0), column_at);
  return PF_NORMAL;
}
