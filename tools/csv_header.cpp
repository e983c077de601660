#include "csv_header.h"

#include <algorithm>
#include <optional>
#include <string_view>
#include <unordered_set>

#include "failure.h"
#include "find.h"
#include "names.h"
#include "output.h"
#include "text.h"

namespace tool {
namespace {

// ---- Names --------------------------------------------------------------------------------------

void check_names(const CsvReader& reader, const CsvRecord& header,
                 const std::vector<std::string>& names) {
  std::unordered_set<std::string_view> seen;
  for (std::size_t i = 0; i < names.size(); ++i) {
    const std::string& name = names[i];
    if (name.empty()) {
      const std::string number = std::to_string(i + 1);
      reader.fail(header.line,
                  "column " + number + " has no name; --shorten-names calls it column" + number);
    }
    try {
      check_new_name(name, "a column's name");
    } catch (const Failure& failure) {
      reader.fail(header.line, std::string(failure.what()) + "; --shorten-names cuts them");
    }
    if (!seen.insert(name).second) {
      reader.fail(header.line, "column " + in_quotes(name) +
                                   " is named twice; --shorten-names numbers such names");
    }
  }
}

std::vector<std::string> names_in_text(CsvReader& reader, const ImportOptions& options,
                                       CsvHeader& header) {
  CsvRecord record;
  if (!reader.next(record)) {
    reader.fail(1, "there is no header row with the names of the columns");
  }
  std::vector<std::string> names;
  for (const CsvField& field : record.fields) {
    names.emplace_back(field.is_quoted ? field.text : trimmed(field.text));
  }
  header.has_trailing_delimiter =
      names.size() > 1 && names.back().empty() && !options.shortens_names;
  if (header.has_trailing_delimiter) names.pop_back();
  if (options.shortens_names) {
    shorten_names(names);
  } else {
    check_names(reader, record, names);
  }
  return names;
}

std::vector<std::string> names_without_header(CsvReader& reader, const ImportOptions& options,
                                              const std::vector<std::string>& table_columns) {
  if (!options.columns.empty()) {
    std::vector<std::string> names = split_at_commas(options.columns);
    for (const std::string& name : names) check_new_name(name, "a column's name");
    return names;
  }
  if (!table_columns.empty()) return table_columns;
  std::vector<std::string> names(reader.count_fields());
  if (names.empty()) reader.fail(1, "there are no rows, and no --columns names them");
  shorten_names(names);
  return names;
}

// ---- Columns ------------------------------------------------------------------------------------

std::string listed(const std::vector<std::string>& names) {
  constexpr std::size_t kMost = 40;
  std::string text;
  for (std::size_t i = 0; i < std::min(names.size(), kMost); ++i) {
    if (i > 0) text += ", ";
    text += visible(names[i]);
  }
  return names.size() > kMost ? text + ", ..." : text;
}

std::size_t field_named(const std::string& name, const std::vector<std::string>& names,
                        const CsvReader& reader, const char* option) {
  const auto found = std::find(names.begin(), names.end(), name);
  if (found != names.end()) return static_cast<std::size_t>(found - names.begin());
  throw Failure(kRefused, std::string(option) + ": " + reader.source().name() + " has no column " +
                              in_quotes(name) + "; it has " + listed(names));
}

void check_settings(const ImportOptions& options, const std::vector<std::string>& names,
                    const CsvReader& reader) {
  for (const auto& type : options.types) field_named(type.first, names, reader, "--types");
  for (const auto& width : options.widths) field_named(width.first, names, reader, "--width");
}

void choose_columns(CsvHeader& header, const std::vector<std::string>& names,
                    const ImportOptions& options, const CsvReader& reader) {
  if (!header.is_in_text || options.columns.empty()) {
    for (std::size_t i = 0; i < names.size(); ++i) header.columns.push_back({names[i], i});
    return;
  }
  const auto is_name = [&](const std::string& name) {
    return std::find(names.begin(), names.end(), name) != names.end();
  };
  for (const std::string& name : split_names(options.columns, is_name)) {
    const std::size_t field = field_named(name, names, reader, "--columns");
    const bool is_repeated =
        std::any_of(header.columns.begin(), header.columns.end(),
                    [&](const CsvHeader::Column& column) { return column.field == field; });
    if (is_repeated) throw Failure(kUsage, "--columns names " + in_quotes(name) + " twice");
    header.columns.push_back({name, field});
  }
}

// ---- Records ------------------------------------------------------------------------------------

bool are_empty(const CsvRecord& record, std::size_t from) {
  return std::all_of(record.fields.begin() + static_cast<std::ptrdiff_t>(from), record.fields.end(),
                     [](const CsvField& field) { return trimmed(field.text).empty(); });
}

std::string advice_for_ragged(const CsvRecord& record, const CsvHeader& header, char delimiter) {
  if (record.fields.size() < header.fields) return "; --fill takes those that it lacks as empty";
  if (are_empty(record, header.fields)) return "; --fill leaves out the empty ones behind them";
  if (header.has_trailing_delimiter && record.fields.size() == header.fields + 1) {
    return ": its last column has no name; --shorten-names gives it one";
  }
  if (header.fields == 1) {
    return "; where lines in front are no CSV, --skip N or --comment TEXT leaves them out";
  }
  return "; put quotes around a field that has " + delimiter_words(delimiter) + " in it";
}

[[noreturn]] void refuse_ragged(const CsvReader& reader, const CsvRecord& record,
                                const CsvHeader& header) {
  const std::size_t count = record.fields.size();
  reader.fail(record.line, "it has " + counted(count, "field") + " where the " +
                               (header.is_in_text ? "header has " : "columns are ") +
                               std::to_string(header.fields) +
                               advice_for_ragged(record, header, reader.delimiter()));
}

}  // namespace

bool CsvHeader::next(CsvReader& reader, CsvRecord& record, const ImportOptions& options) const {
  if (!reader.next(record)) return false;
  const std::size_t count = record.fields.size();
  if (count == fields) return true;
  const bool is_short = count < fields;
  const bool ends_empty = !is_short && are_empty(record, fields);
  const bool is_trailing = has_trailing_delimiter && count == fields + 1 && ends_empty;
  const bool is_filled = options.fills && (is_short || ends_empty);
  if (!is_trailing && !is_filled) refuse_ragged(reader, record, *this);
  return true;
}

CsvReader open_csv(CsvSource& source, ImportOptions& options) {
  CsvReader reader(source, options.dialect);
  if (!options.has_delimiter) {
    static constexpr std::string_view kStatement = "sep=";  // as spreadsheets write it
    const std::string_view line = reader.peek_line();
    if (line.size() == kStatement.size() + 1 && line.starts_with(kStatement)) {
      options.dialect.delimiter = line.back();
      reader.set_delimiter(line.back());
      reader.skip_line();
      ++options.dialect.skip;
    } else if (const auto found = recognised_delimiter(line, options.rules.has_decimal_comma)) {
      reader.set_delimiter(*found);
      options.dialect.delimiter = *found;
      note(source.name() + ": its fields have " + delimiter_words(*found) +
           " between them; --delimiter says otherwise");
    }
    options.has_delimiter = true;
  }
  options.rules.may_have_decimal_comma = options.dialect.delimiter != ',';
  return reader;
}

CsvHeader read_header(CsvReader& reader, const ImportOptions& options,
                      const std::vector<std::string>& table_columns) {
  CsvHeader header;
  header.is_in_text = options.has_header;
  const std::vector<std::string> names = header.is_in_text
                                             ? names_in_text(reader, options, header)
                                             : names_without_header(reader, options, table_columns);
  header.fields = names.size();
  check_settings(options, names, reader);
  choose_columns(header, names, options, reader);
  reader.read_empty_lines(header.fields == 1);
  return header;
}

}  // namespace tool
