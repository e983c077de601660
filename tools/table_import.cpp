#include "table_import.h"

#include <algorithm>
#include <limits>
#include <optional>
#include <utility>
#include <vector>

#include "csv.h"
#include "failure.h"
#include "find.h"
#include "text.h"
#include "values.h"

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
  if (would_lose_digits(text) || parse_value(Type::float64, text, value) != Parsed::kValue) {
    shape.numbers = false;
    return;
  }
  const double number = std::get<double>(value);
  shape.integers = shape.integers && parse_value(Type::int32, text, value) == Parsed::kValue;
  if (!std::any_of(text.begin(), text.end(), is_digit)) {
    shape.has_infinity = shape.has_infinity || !is_nan(number);
    return;
  }
  shape.has_digits = true;
  shape.precision = std::clamp(significant_digits(number), shape.precision, kMostPrecision);
}

Type type_of(const Shape& shape) {
  if (!shape.numbers || !shape.has_digits) return Type::string;
  return shape.integers && !shape.has_empty ? Type::int32 : Type::float64;
}

tevpf::Column column_for(const std::string& name, const Shape& shape) {
  tevpf::Column column(name, type_of(shape));
  if (column.type() == Type::string) column.width(static_cast<std::int32_t>(shape.longest));
  if (column.type() == Type::float64) {
    static constexpr double kInfinity = std::numeric_limits<double>::infinity();
    column.precision(shape.precision).width(shape.precision + 7);  // sign, point and exponent
    if (shape.has_infinity) column.bounds(-kInfinity, kInfinity);
  }
  return column;
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

tevpf::Table make_table(tevpf::File& file, const std::string& name, const CsvText& csv) {
  CsvReader reader(csv.text, csv.name);
  const std::vector<std::string> names = read_header(reader);
  std::vector<Shape> shapes(names.size());
  CsvRecord record;
  while (next_row(reader, record, names.size())) {
    for (std::size_t i = 0; i < names.size(); ++i) fit(shapes[i], record.fields[i]);
  }
  std::optional<tevpf::Table> table = file.find_table(name);
  if (!table) table = file.create_table(name);
  for (std::size_t i = 0; i < names.size(); ++i) table->add_column(column_for(names[i], shapes[i]));
  return *table;
}

class RowLoader {
 public:
  RowLoader(const tevpf::File& file, tevpf::Table table, const CsvText& csv)
      : table_(std::move(table)), columns_(file, table_), reader_(csv.text, csv.name) {
    for (const std::string& name : read_header(reader_)) {
      positions_.push_back(columns_.position_of(name));
    }
  }

  std::size_t load_all() {
    const tevpf::Row default_row = table_.new_row();
    std::size_t count = 0;
    for (CsvRecord record; next_row(reader_, record, positions_.size()); ++count) {
      tevpf::Row row = default_row;
      for (std::size_t i = 0; i < positions_.size(); ++i) {
        row.set(positions_[i], value_of(column(i), record.fields[i], record.line));
      }
      try {
        table_.append(row);
      } catch (const tevpf::Error& error) {
        refuse_row(error, record);
      }
    }
    return count;
  }

 private:
  const tevpf::Column& column(std::size_t field) const { return columns_[positions_[field]]; }

  [[noreturn]] void refuse(const tevpf::Column& column, std::size_t line, const std::string& why) {
    reader_.fail(line,
                 "column " + in_quotes(column.name()) + ": " + why + "; nothing was imported");
  }

  Value value_of(const tevpf::Column& column, const std::string& field, std::size_t line) {
    if (column.type() == Type::string) {
      const auto width = static_cast<std::size_t>(column.width());
      if (field.size() <= width) return field;
      refuse(column, line,
             "the text has " + counted(field.size(), "byte") + ", the column holds " +
                 std::to_string(width));
    }
    const bool is_empty = trimmed(field).empty();
    if (is_empty && !is_floating(column.type())) {
      refuse(column, line, "the field is empty, but an integer column needs a number in each row");
    }
    Value value;
    const Parsed parsed = parse_value(column.type(), is_empty ? "nan" : field, value);
    if (parsed != Parsed::kValue) refuse(column, line, refused_value(field, parsed, column));
    // What is not a number equals everything: it would spoil the order of an index.
    if (column.is_indexed() && is_nan(value)) {
      refuse(column, line, "the column has an index, so each row needs a number");
    }
    return value;
  }

  [[noreturn]] void refuse_row(const tevpf::Error& error, const CsvRecord& record) {
    for (std::size_t i = 0; i < positions_.size(); ++i) {
      if (error.status() == PF_RANGE && column(i).name() == error.value()) {
        refuse(column(i), record.line,
               refused_value(record.fields[i], Parsed::kOutOfRange, column(i)));
      }
    }
    reader_.fail(record.line, visible(error.what()) + "; nothing was imported");
  }

  tevpf::Table table_;
  Columns columns_;
  CsvReader reader_;
  std::vector<std::size_t> positions_;  // of the fields' columns
};

}  // namespace

std::size_t import_csv(tevpf::File& file, const std::string& name, const CsvText& csv) {
  std::optional<tevpf::Table> table = file.find_table(name);
  if (!table && file.find_list(name)) {
    throw Failure(kRefused, visible(file.name()) + ": " + in_quotes(name) +
                                " is a list; rows go into tables, so choose another name");
  }
  if (!table || table->columns().empty()) table = make_table(file, name, csv);
  return RowLoader(file, *std::move(table), csv).load_all();
}

}  // namespace tool
