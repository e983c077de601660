#include "new_table.h"

#include <algorithm>
#include <cstdint>
#include <optional>
#include <vector>

#include "csv_header.h"
#include "failure.h"
#include "output.h"
#include "text.h"

namespace tool {
namespace {

// ---- What the CSV holds -------------------------------------------------------------------------

struct Contents {
  CsvHeader header;
  std::vector<ColumnShape> shapes;  // of the chosen columns
  std::size_t rows = 0;
  std::uintmax_t bytes = 0;
};

Contents read_contents(CsvSource& source, ImportOptions& options, Progress& progress) {
  CsvReader reader = open_csv(source, options);
  Contents contents{read_header(reader, options, {}), {}};
  const std::vector<CsvHeader::Column>& columns = contents.header.columns;
  contents.shapes.resize(columns.size());
  std::vector<const std::string*> defaults;
  for (const CsvHeader::Column& column : columns) {
    defaults.push_back(options.defaults.find(column.name));
  }
  const auto share = [&] {
    return source.size() == 0 ? 0
                              : static_cast<double>(source.bytes_read()) /
                                    (2 * static_cast<double>(source.size()));
  };
  for (CsvRecord record; contents.header.next(reader, record, options); ++contents.rows) {
    for (std::size_t i = 0; i < columns.size(); ++i) {
      const std::size_t field = columns[i].field;
      std::string_view text =
          field < record.fields.size() ? record.fields[field].text : std::string_view();
      if (defaults[i] != nullptr && options.rules.is_missing(text)) text = *defaults[i];
      contents.shapes[i].fit(text, record.line, options.rules);
    }
    progress.step(contents.rows, share);
  }
  contents.bytes = source.bytes_read();
  return contents;
}

// ---- Its columns --------------------------------------------------------------------------------

tevpf::Type type_for(const std::string& name, const ColumnShape& shape,
                     const ImportOptions& options) {
  if (const tevpf::Type* const type = options.types.find(name)) return *type;
  return options.type_of_others.value_or(shape.type());
}

// What a column of texts may hide: numbers that the user can have by an option.
void speak_of_numbers(const std::string& name, const ColumnShape& shape, const CsvSource& source) {
  if (const auto comma = shape.decimal_comma()) {
    throw Failure(kRefused, source.name() + ", line " + std::to_string(comma->line) + ": column " +
                                in_quotes(name) + " has numbers with a decimal comma, " +
                                in_quotes(comma->text) + "; give --decimal-comma, or --types " +
                                visible(name) + "=string to keep them as texts");
  }
  if (const auto marker = shape.marker_among_numbers()) {
    note(source.name() + ", line " + std::to_string(marker->line) + ": column " + in_quotes(name) +
         " becomes a string because of " + in_quotes(marker->text) + "; --missing " +
         in_quotes(marker->text) + " makes that a missing number");
  }
}

// Once: all columns of a CSV are written alike.
void speak_of_bytes(const Contents& contents, const CsvSource& source) {
  for (const ColumnShape& shape : contents.shapes) {
    if (const auto text = shape.not_utf8()) {
      return note(source.name() + ", line " + std::to_string(text->line) + ": " +
                  in_quotes(text->text) +
                  " is not UTF-8; texts keep their bytes; 'iconv -f LATIN1 " +
                  "-t UTF-8' converts a file that is LATIN1");
    }
  }
}

tevpf::Column column_for(const std::string& name, const ColumnShape& shape,
                         const ImportOptions& options, const CsvSource& source) {
  const tevpf::Type type = type_for(name, shape, options);
  const bool is_own_choice = options.types.find(name) != nullptr || options.type_of_others;
  if (!is_own_choice) speak_of_numbers(name, shape, source);
  const std::size_t* const width = options.widths.find(name);
  if (width != nullptr && type != tevpf::Type::string) {
    throw Failure(kRefused, "--width: column " + in_quotes(name) + " is no string but " +
                                tevpf::to_string(type) + "; --types " + visible(name) +
                                "=string makes it one");
  }
  return shape.column(name, type, width != nullptr ? *width : shape.longest());
}

// ---- Its size -----------------------------------------------------------------------------------

std::string megabytes(std::uintmax_t bytes) {
  return std::to_string((bytes + 500'000) / 1'000'000) + " MB";
}

// Rows are of fixed width: one long text makes all of them long.
void refuse_waste(const tevpf::Table& table, const Contents& contents, const ImportOptions& options,
                  const CsvSource& source) {
  constexpr std::uintmax_t kNoMatter = 1'000'000, kTimes = 10;
  const std::uintmax_t bytes = std::uintmax_t{table.row_size()} * contents.rows;
  if (bytes <= kNoMatter || bytes / kTimes <= contents.bytes) return;
  const std::vector<tevpf::Column> columns = table.columns();
  const auto widest = std::max_element(columns.begin(), columns.end(),
                                       [](const tevpf::Column& a, const tevpf::Column& b) {
                                         const auto bytes_of = [](const tevpf::Column& c) {
                                           return c.type() == tevpf::Type::string ? c.width() : 0;
                                         };
                                         return bytes_of(a) < bytes_of(b);
                                       });
  if (options.is_forced || options.widths.find(widest->name()) != nullptr)
    return;  // as was asked for
  const ColumnShape& shape = contents.shapes[static_cast<std::size_t>(widest - columns.begin())];
  throw Failure(kRefused, source.name() + ", line " + std::to_string(shape.longest_line()) +
                              ": column " + in_quotes(widest->name()) + ": the text has " +
                              counted(shape.longest(), "byte") +
                              ", and every row would take as many: the table would have " +
                              megabytes(bytes) + ", " + std::to_string(bytes / contents.bytes) +
                              " times the CSV; --width " + visible(widest->name()) +
                              "=N cuts its texts to N bytes, --force makes the table as it is");
}

}  // namespace

tevpf::Table make_table_for(tevpf::File& file, const std::string& name, CsvSource& source,
                            ImportOptions& options, Progress& progress) {
  const Contents contents = read_contents(source, options, progress);
  std::optional<tevpf::Table> table = file.find_table(name);
  if (!table) table = file.create_table(name);
  const std::vector<CsvHeader::Column>& columns = contents.header.columns;
  for (std::size_t i = 0; i < columns.size(); ++i) {
    table->add_column(column_for(columns[i].name, contents.shapes[i], options, source));
  }
  refuse_waste(*table, contents, options, source);
  speak_of_bytes(contents, source);
  return *table;
}

}  // namespace tool
