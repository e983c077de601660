#include "row_filler.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <limits>
#include <type_traits>
#include <variant>

#include "failure.h"
#include "number_text.h"
#include "output.h"
#include "text.h"

namespace tool {
namespace {

std::size_t size_of(const tevpf::Column& column) {
  std::int32_t size = 0;
  (void)TEV8R1_compute_size(static_cast<std::int32_t>(column.type()), column.width(), &size);
  return static_cast<std::size_t>(size);
}

std::vector<std::size_t> column_offsets(const tevpf::Table& table, const std::string& name) {
  std::vector<std::size_t> result(table.columns().size());  // this makes the file current
  std::int32_t count = 0;
  std::int32_t* offsets = nullptr;
  if (TEV8R1_PF_inq_col_offsets(name.c_str(), &count, &offsets) != PF_NORMAL)
    throw std::bad_alloc();
  std::copy_n(offsets, std::min<std::size_t>(result.size(), static_cast<std::size_t>(count)),
              result.begin());
  std::free(offsets);
  return result;
}

std::vector<unsigned char> bytes_of(const Value& value, std::size_t size) {
  std::vector<unsigned char> bytes(size);
  std::visit(
      [&](const auto& v) {
        if constexpr (std::is_same_v<std::decay_t<decltype(v)>, std::string>) {
          std::memcpy(bytes.data(), v.data(), std::min(v.size(), size - 1));
        } else {
          std::memcpy(bytes.data(), &v, sizeof v);
        }
      },
      value);
  return bytes;
}

Value not_a_number(Type type) {
  if (type == Type::float32) return std::numeric_limits<float>::quiet_NaN();
  return std::numeric_limits<double>::quiet_NaN();
}

// The integer nearest to 0 within the bounds.
Value integer_near_zero(const tevpf::Column& column) {
  return std::visit(
      [&](const auto& min) -> Value {
        using T = std::decay_t<decltype(min)>;
        if constexpr (std::is_integral_v<T>) {
          return std::clamp(T{0}, min, std::get<T>(column.bounds()->max));
        } else {
          return min;
        }
      },
      column.bounds()->min);
}

}  // namespace

RowFiller::RowFiller(const tevpf::Table& table, const Columns& columns, const CsvHeader& header,
                     const CsvReader& reader, const ImportOptions& options)
    : table_name_(table.name()),
      columns_(columns),
      reader_(reader),
      options_(options),
      offsets_(column_offsets(table, table_name_)),
      row_(table.row_size()) {
  std::vector<bool> is_filled(columns.size());
  for (const CsvHeader::Column& column : header.columns) {
    const std::size_t position = columns.position_of(column.name);
    targets_.push_back(target(position, column.field));
    is_filled[position] = true;
  }
  for (const auto& given : options.defaults) columns.position_of(given.first);
  for (std::size_t i = 0; i < columns.size(); ++i) {
    if (!is_filled[i]) leave_out(target(i, 0));
  }
}

// ---- Missing values -----------------------------------------------------------------------------

RowFiller::Target RowFiller::target(std::size_t column, std::size_t field) const {
  Target result{&columns_[column], field, offsets_[column], size_of(columns_[column]), {}};
  result.missing = missing_value(result);
  const bool is_new_width = options_.widths.find(result.column->name()) != nullptr;
  result.may_cut = is_new_width && result.column->type() == Type::string;
  return result;
}

// What is not a number equals everything: it would spoil the order of an index.
std::vector<unsigned char> RowFiller::missing_value(const Target& target) const {
  const tevpf::Column& column = *target.column;
  if (const std::string* const text = options_.defaults.find(column.name())) {
    Value value;
    const Parsed parsed = parse_value(column.type(), *text, value);
    const bool is_text = column.type() == Type::string;
    if (parsed != Parsed::kValue) {
      throw Failure(kRefused, "--default " + in_quotes(column.name()) + ": " +
                                  refused_value(*text, parsed, column));
    }
    if ((is_text && text->size() >= target.size) || (column.is_indexed() && is_nan(value))) {
      throw Failure(kRefused, "--default " + in_quotes(column.name()) + ": " + in_quotes(*text) +
                                  (is_text ? " is longer than the column is wide"
                                           : " cannot be in a column with an index"));
    }
    std::vector<unsigned char> bytes = bytes_of(value, target.size);
    if (TEV8R1_validate_row_value(table_name_.c_str(), column.name().c_str(), bytes.data()) ==
        PF_RANGE) {
      throw Failure(kRefused, "--default " + in_quotes(column.name()) + ": " +
                                  refused_value(*text, Parsed::kOutOfRange, column));
    }
    return bytes;
  }
  if (column.type() == Type::string) return bytes_of(std::string(), target.size);
  if (is_floating(column.type()) && !column.is_indexed()) {
    return bytes_of(not_a_number(column.type()), target.size);
  }
  return {};
}

void RowFiller::leave_out(const Target& target) {
  const tevpf::Column& column = *target.column;
  std::vector<unsigned char> value = target.missing;
  const std::string subject =
      reader_.source().name() + ": column " + in_quotes(column.name()) + " is not in it";
  if (column.is_unique() && options_.defaults.find(column.name()) == nullptr) {
    throw Failure(kRefused, subject +
                                ", but it is unique: each row needs a value of its own; add "
                                "the column to the CSV");
  }
  if (value.empty() && is_floating(column.type())) {
    throw Failure(kRefused, subject +
                                ", but it has an index, so each row needs a number; add it to "
                                "the CSV, or give --default " +
                                column.name() + "=NUMBER");
  }
  if (value.empty()) {
    const Value number = integer_near_zero(column);
    value = bytes_of(number, target.size);
    differences_.push_back(subject + ", and integers have no missing value: its rows got " +
                           exact_text(number) + "; --default " + visible(column.name()) +
                           "=NUMBER gives them another one");
  }
  std::memcpy(row_.data() + target.offset, value.data(), value.size());
}

// ---- Fields -------------------------------------------------------------------------------------

const unsigned char* RowFiller::fill(const CsvRecord& record) {
  for (Target& target : targets_) {
    const std::string_view field =
        target.field < record.fields.size() ? record.fields[target.field].text : std::string_view();
    if (!options_.rules.is_missing(field)) {
      fill_field(target, field, record.line);
    } else if (target.column->type() == Type::string && !field.empty() && trimmed(field).empty()) {
      fill_text(target, field, record.line);  // blanks are a text
    } else if (!target.missing.empty()) {
      std::memcpy(row_.data() + target.offset, target.missing.data(), target.missing.size());
    } else {
      refuse(target, record.line,
             std::string(is_floating(target.column->type())
                             ? "the field is empty, but a column with an index"
                             : "the field is empty, but an integer column") +
                 " needs a number in each row; --default " + visible(target.column->name()) +
                 "=NUMBER stands for such fields");
    }
  }
  return row_.data();
}

void RowFiller::fill_field(Target& target, std::string_view field, std::size_t line) {
  if (target.column->type() == Type::string) return fill_text(target, field, line);
  if (!options_.rules.has_decimal_comma) return fill_number(target, field, line);
  const std::string number = with_decimal_point(field);
  if (number.empty()) {
    refuse(target, line, refused_value(std::string(field), Parsed::kNotANumber, *target.column));
  }
  fill_number(target, number, line);
}

void RowFiller::fill_text(Target& target, std::string_view text, std::size_t line) {
  if (text.size() >= target.size) {
    if (!target.may_cut) {
      refuse(target, line,
             "the text has " + counted(text.size(), "byte") + ", the column holds " +
                 std::to_string(target.size - 1));
    }
    text = cut(text, target.size - 1);
    ++target.cut;
  }
  unsigned char* const place = row_.data() + target.offset;
  std::memcpy(place, text.data(), text.size());
  std::memset(place + text.size(), 0, target.size - text.size());
}

void RowFiller::fill_number(const Target& target, std::string_view text, std::size_t line) {
  const auto store = [&](auto number) {
    const Parsed parsed = parse_number(text, number);
    if (parsed != Parsed::kValue) {
      refuse(target, line, refused_value(std::string(text), parsed, *target.column));
    }
    if (number != number && target.column->is_indexed()) {
      refuse(target, line, "the column has an index, so each row needs a number");
    }
    std::memcpy(row_.data() + target.offset, &number, sizeof number);
  };
  switch (target.column->type()) {
    case Type::int32:
      return store(std::int32_t{});
    case Type::int16:
      return store(std::int16_t{});
    case Type::float32:
      return store(float{});
    default:
      return store(double{});
  }
}

// ---- Refusals -----------------------------------------------------------------------------------

void RowFiller::refuse(const Target& target, std::size_t line, const std::string& why) const {
  reader_.fail(
      line, "column " + in_quotes(target.column->name()) + ": " + why + "; nothing was imported");
}

void RowFiller::refuse_row(const tevpf::Error& error, const CsvRecord& record) const {
  for (const Target& target : targets_) {
    if (error.status() != PF_RANGE) break;
    const TEVPF_STATUS status = TEV8R1_validate_row_value(
        table_name_.c_str(), target.column->name().c_str(), row_.data() + target.offset);
    if (status == PF_RANGE) {
      const bool is_there = target.field < record.fields.size();
      refuse(target, record.line,
             refused_value(is_there ? std::string(record.fields[target.field].text) : "",
                           Parsed::kOutOfRange, *target.column));
    }
  }
  reader_.fail(record.line, visible(error.what()) + "; nothing was imported");
}

void RowFiller::tell_differences() const {
  for (const std::string& difference : differences_) note(difference);
  for (const Target& target : targets_) {
    if (target.cut == 0) continue;
    note(reader_.source().name() + ": " + counted(target.cut, "text") + " of column " +
         in_quotes(target.column->name()) + " " + (target.cut == 1 ? "was" : "were") + " cut to " +
         counted(target.size - 1, "byte"));
  }
}

}  // namespace tool
