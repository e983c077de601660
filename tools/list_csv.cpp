#include "list_csv.h"

#include <algorithm>
#include <array>
#include <cstdint>
#include <iterator>
#include <optional>
#include <string_view>

#include "csv_header.h"
#include "failure.h"
#include "text.h"
#include "values.h"

namespace tool {
namespace {

enum Field { kName, kType, kValue, kMinimum, kMaximum, kUnits, kPrecision, kDescription, kFields };
constexpr std::string_view kHeader[kFields] = {"name",    "type",  "value",     "minimum",
                                               "maximum", "units", "precision", "description"};

// ---- Reading ------------------------------------------------------------------------------------

class ParameterReader {
 public:
  ParameterReader(CsvReader& reader, const ImportOptions& options)
      : reader_(reader), options_(options), header_(read_header(reader, options, {})) {
    fields_.fill(kNone);
    for (const CsvHeader::Column& column : header_.columns) {
      const auto* const found = std::find(std::begin(kHeader), std::end(kHeader), column.name);
      if (found == std::end(kHeader)) {
        throw Failure(kRefused, reader.source().name() + ": a list has no column " +
                                    in_quotes(column.name) + "; its columns are " + all_columns());
      }
      fields_[static_cast<std::size_t>(found - kHeader)] = column.field;
    }
    for (const Field field : {kName, kType, kValue}) {
      if (fields_[field] != kNone) continue;
      throw Failure(kRefused, reader.source().name() + ": column " + in_quotes(kHeader[field]) +
                                  " is not in it; a list needs name, type and value");
    }
  }

  std::optional<tevpf::Parameter> next() {
    if (!header_.next(reader_, record_, options_)) return std::nullopt;
    try {
      return parameter();
    } catch (const tevpf::Error& error) {
      refuse(visible(error.what()));
    }
  }

  [[noreturn]] void refuse(const std::string& why) const {
    reader_.fail(record_.line, why + "; nothing was imported");
  }

 private:
  static constexpr std::size_t kNone = static_cast<std::size_t>(-1);

  static std::string all_columns() {
    std::string text;
    for (const std::string_view name : kHeader) {
      if (!text.empty()) text += ", ";
      text += name;
    }
    return text;
  }

  std::string_view text(Field field) const {
    return fields_[field] < record_.fields.size() ? record_.fields[fields_[field]].text
                                                  : std::string_view();
  }

  tevpf::Parameter parameter() const {
    const std::string name(text(kName));
    const auto type = type_named(trimmed(text(kType)));
    if (!type) {
      refuse(in_quotes(text(kType)) +
             " is no type; types are integer, short, real, double and "
             "string; --table makes a table of these lines");
    }
    tevpf::Parameter result(name, value(*type, kValue));
    result.units(text(kUnits)).description(text(kDescription));
    set_bounds(result);
    if (is_floating(*type) && !text(kPrecision).empty()) result.precision(precision());
    return result;
  }

  // Where only one bound is given, the other one is that of the type.
  void set_bounds(tevpf::Parameter& parameter) const {
    const bool has_min = !text(kMinimum).empty(), has_max = !text(kMaximum).empty();
    if (!has_min && !has_max) return;
    if (parameter.type() == Type::string) refuse("a string has no bounds");
    const tevpf::Bounds whole = *parameter.bounds();
    const Value min = has_min ? value(parameter.type(), kMinimum) : whole.min;
    const Value max = has_max ? value(parameter.type(), kMaximum) : whole.max;
    parameter.bounds(cell(min), cell(max));
  }

  static tevpf::Cell cell(const Value& value) {
    return std::visit([](const auto& v) { return tevpf::Cell(v); }, value);
  }

  Value value(Type type, Field field) const {
    const std::string given(text(field));
    Value result;
    const Parsed parsed = parse_value(type, given, result);
    if (parsed == Parsed::kValue) return result;
    refuse("column " + in_quotes(kHeader[field]) + ": " + refused_value(given, parsed, type, {}));
  }

  std::int32_t precision() const { return std::get<std::int32_t>(value(Type::int32, kPrecision)); }

  CsvReader& reader_;
  const ImportOptions& options_;
  CsvHeader header_;
  CsvRecord record_;
  std::array<std::size_t, kFields> fields_{};  // of a record; kNone: not in it
};

}  // namespace

void export_list(CsvWriter& writer, const tevpf::List& list, bool has_header) {
  if (has_header) {
    for (const std::string_view name : kHeader) writer.text(name);
    writer.end_record();
  }
  for (const tevpf::Parameter& p : list) {
    writer.text(p.name());
    writer.text(tevpf::to_string(p.type()));
    writer.value(p.value());
    writer.value(p.bounds() ? p.bounds()->min : Value(std::string()));
    writer.value(p.bounds() ? p.bounds()->max : Value(std::string()));
    writer.text(p.units());
    writer.value(is_floating(p.type()) ? Value(p.precision()) : Value(std::string()));
    writer.text(p.description());
    writer.end_record();
  }
}

bool is_exported_list(CsvSource& source, ImportOptions& options) {
  if (!options.has_header) return false;
  CsvReader reader = open_csv(source, options);
  CsvRecord header;
  const bool is_list =
      reader.next(header) &&
      std::equal(
          header.fields.begin(), header.fields.end(), std::begin(kHeader), std::end(kHeader),
          [](const CsvField& field, std::string_view name) { return trimmed(field.text) == name; });
  source.start_over();
  return is_list;
}

std::size_t import_parameters(tevpf::File& file, const std::string& name, CsvSource& source,
                              ImportOptions& options) {
  CsvReader reader = open_csv(source, options);
  ParameterReader parameters(reader, options);
  std::optional<tevpf::List> list = file.find_list(name);
  if (!list) list = file.create_list(name);
  std::size_t count = 0;
  for (; const auto parameter = parameters.next(); ++count) {
    try {
      list->add(*parameter);
    } catch (const tevpf::Error& error) {
      parameters.refuse(visible(error.what()));
    }
  }
  return count;
}

}  // namespace tool
