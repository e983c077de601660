#include "table_import.h"

#include <algorithm>
#include <cstring>
#include <limits>
#include <type_traits>
#include <vector>

#include "csv.h"
#include "elements.h"
#include "messages.h"
#include "tevpf.h"
#include "text.h"

namespace tool {
namespace {

constexpr std::size_t kExactDigits = 15;  // every integer of so many digits is a double
constexpr int kLeastPrecision = 6, kMostPrecision = 17;

bool is_digit(char c) { return c >= '0' && c <= '9'; }

// ---- Making columns that fit ----

// What the fields of one column have in common.
struct Shape {
  bool integers = true, numbers = true;  // of those that are not empty
  bool has_digits = false, has_empty = false, has_infinity = false;
  std::size_t longest = 1;
  int precision = kLeastPrecision;  // significant digits that show every number exactly
};

int significant_digits(double number) {
  const std::string text = exact_text(number);
  const std::string_view mantissa = std::string_view(text).substr(0, text.find('e'));
  const std::size_t first = mantissa.find_first_of("123456789");
  if (first == std::string_view::npos) return 1;
  return static_cast<int>(std::count_if(mantissa.begin() + static_cast<std::ptrdiff_t>(first),
                                        mantissa.end(), is_digit));
}

// Digits that a number would lose make a text: leading zeros, and integers beyond what a double
// tells apart.
bool would_lose_digits(std::string_view text) {
  if (text.front() == '-' || text.front() == '+') text.remove_prefix(1);
  if (text.size() > 1 && text[0] == '0' && is_digit(text[1])) return true;
  return text.size() > kExactDigits && std::all_of(text.begin(), text.end(), is_digit);
}

void fit(Shape& shape, std::string_view field) {
  shape.longest = std::max(shape.longest, field.size());
  const std::string_view text = trimmed(field);
  if (text.empty()) {
    shape.has_empty = true;
    return;
  }
  if (!shape.numbers) return;
  Value value;
  if (would_lose_digits(text) || parse_value(PF_TYPE_DOUBLE, text, value) != Parsed::kValue) {
    shape.numbers = false;
    return;
  }
  const double number = std::get<double>(value);
  shape.integers = shape.integers && parse_value(PF_TYPE_INT, text, value) == Parsed::kValue;
  if (!std::any_of(text.begin(), text.end(), is_digit)) {
    shape.has_infinity = shape.has_infinity || !is_nan(number);
    return;
  }
  shape.has_digits = true;
  shape.precision = std::clamp(significant_digits(number), shape.precision, kMostPrecision);
}

std::int32_t type_of(const Shape& shape) {
  if (!shape.numbers || !shape.has_digits) return PF_TYPE_STRING;
  return shape.integers && !shape.has_empty ? PF_TYPE_INT : PF_TYPE_DOUBLE;
}

void define_column(const PfFile& file, const std::string& table, const std::string& name,
                   const Shape& shape) {
  const std::int32_t type = type_of(shape);
  TEVPF_COL_DEF def{};
  require(TEV8R1_PF_inq_col_dft(table.c_str(), type, &def), file.path(), "make a column");
  def.description = nullptr;  // the templates of a new table have none
  std::memcpy(def.name, name.c_str(), name.size() + 1);
  if (type == PF_TYPE_STRING) def.width = static_cast<std::int32_t>(shape.longest);
  if (type == PF_TYPE_DOUBLE) {
    def.limits.f64.precision = shape.precision;
    def.width = shape.precision + 7;  // sign, point and exponent
    if (shape.has_infinity) {
      def.limits.f64.max = std::numeric_limits<double>::infinity();
      def.limits.f64.min = -std::numeric_limits<double>::infinity();
    }
  }
  require(TEV8R1_PF_def_column(table.c_str(), def), file.path(), "make a column");
}

// ---- Reading rows ----

std::vector<std::string> read_header(CsvReader& reader) {
  CsvRecord header;
  if (!reader.next(header)) reader.fail(1, "there is no header row with the names of the columns");
  for (std::string& name : header.fields) {
    name = std::string(trimmed(name));
    try {
      check_new_name(name, "a column's name");
    } catch (const Failure& failure) {
      reader.fail(header.line, failure.what());
    }
    if (std::count(header.fields.begin(), header.fields.end(), name) > 1) {
      reader.fail(header.line, "column " + in_quotes(name) + " is named twice");
    }
  }
  return header.fields;
}

bool next_row(CsvReader& reader, CsvRecord& record, std::size_t fields) {
  if (!reader.next(record)) return false;
  if (record.fields.size() != fields) {
    reader.fail(record.line, "it has " + counted(record.fields.size(), "field") +
                                 " where the header has " + std::to_string(fields));
  }
  return true;
}

void make_table(const PfFile& file, const std::string& table, const CsvText& csv) {
  CsvReader reader(csv.text, csv.name);
  const std::vector<std::string> names = read_header(reader);
  std::vector<Shape> shapes(names.size());
  CsvRecord record;
  while (next_row(reader, record, names.size())) {
    for (std::size_t i = 0; i < names.size(); ++i) fit(shapes[i], record.fields[i]);
  }
  if (!file.has(Kind::kTable, table)) {
    require(TEV8R1_PF_create_elem(table.c_str(), "", PF_ELEM_TABLE), file.path(), "make the table");
  }
  for (std::size_t i = 0; i < names.size(); ++i) define_column(file, table, names[i], shapes[i]);
}

class RowLoader {
 public:
  RowLoader(const PfFile& file, const std::string& table, const CsvText& csv)
      : table_(file, table), reader_(csv.text, csv.name) {
    for (const std::string& name : read_header(reader_)) {
      columns_.push_back(&table_.columns()[table_.column_position(name)]);
    }
    default_row_.resize(table_.row_size());
    require(TEV8R1_PF_inq_dft_row(table.c_str(), default_row_.data()), file.path(), "read a row");
  }

  std::size_t load_all() {
    std::size_t count = 0;
    for (CsvRecord record; next_row(reader_, record, columns_.size()); ++count) {
      row_ = default_row_;
      for (std::size_t i = 0; i < columns_.size(); ++i) {
        store(*columns_[i], record.fields[i], record.line);
      }
      const TEVPF_STATUS status = TEV8R1_PF_add_row(table_.name().c_str(), row_.data());
      if (status != PF_NORMAL) refuse_row(status, record);
    }
    return count;
  }

 private:
  [[noreturn]] void refuse(const Column& column, std::size_t line, const std::string& why) {
    reader_.fail(line, "column " + in_quotes(column.name) + ": " + why + "; nothing was imported");
  }

  void store(const Column& column, const std::string& field, std::size_t line) {
    if (column.type == PF_TYPE_STRING) {
      store_text(column, field, line);
      return;
    }
    const bool is_empty = trimmed(field).empty();
    if (is_empty && !is_floating(column.type)) {
      refuse(column, line, "the field is empty, but an integer column needs a number in each row");
    }
    Value value;
    const Parsed parsed = parse_value(column.type, is_empty ? "nan" : field, value);
    if (parsed != Parsed::kValue) {
      refuse(column, line, refused_value(field, column.type, parsed, column.bounds, column.units));
    }
    // What is not a number equals everything: it would spoil the order of an index.
    if (column.indexed && is_nan(value)) {
      refuse(column, line, "the column has an index, so each row needs a number");
    }
    std::visit(
        [&](const auto& v) {
          if constexpr (!std::is_same_v<std::decay_t<decltype(v)>, std::string>) {
            std::memcpy(row_.data() + column.offset, &v, sizeof v);
          }
        },
        value);
  }

  void store_text(const Column& column, const std::string& field, std::size_t line) {
    const auto width = static_cast<std::size_t>(column.width);
    if (field.size() > width) {
      refuse(column, line,
             "the text has " + counted(field.size(), "byte") + ", the column holds " +
                 std::to_string(width));
    }
    char* cell = row_.data() + column.offset;
    std::memset(cell, 0, width + 1);
    std::memcpy(cell, field.c_str(), field.size() + 1);
  }

  // The library names the value but not the column: look for the first one that refuses its value.
  [[noreturn]] void refuse_row(TEVPF_STATUS status, const CsvRecord& record) {
    for (std::size_t i = 0; i < columns_.size(); ++i) {
      const Column& column = *columns_[i];
      if (TEV8R1_validate_row_value(table_.name().c_str(), column.name.c_str(),
                                    row_.data() + column.offset) != status) {
        continue;
      }
      if (status == PF_RANGE) {
        refuse(column, record.line,
               refused_value(record.fields[i], column.type, Parsed::kOutOfRange, column.bounds,
                             column.units));
      }
      refuse(column, record.line, reason(status));
    }
    reader_.fail(record.line, reason(status) + "; nothing was imported");
  }

  Table table_;
  CsvReader reader_;
  std::vector<const Column*> columns_;  // in the order of the fields
  std::vector<char> default_row_, row_;
};

}  // namespace

std::size_t import_csv(const PfFile& file, const std::string& table, const CsvText& csv) {
  if (!file.has(Kind::kTable, table) || Table(file, table).columns().empty()) {
    make_table(file, table, csv);
  }
  return RowLoader(file, table, csv).load_all();
}

}  // namespace tool
