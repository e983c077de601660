// tevpf export: a list or a table as CSV, or JSON of it or of the whole file; both read back exactly.
#include <numeric>

#include "commands.h"
#include "csv_dialect.h"
#include "csv_writer.h"
#include "element_json.h"
#include "files.h"
#include "list_csv.h"
#include "names.h"
#include "output.h"
#include "platform.h"
#include "progress.h"
#include "text.h"

namespace tool {
namespace {

CsvStyle style_of(const Arguments& arguments) {
  CsvStyle style;
  if (!arguments.delimiter.empty()) style.delimiter = parse_delimiter(arguments.delimiter);
  if (arguments.crlf) style.line_end = "\r\n";
  if (arguments.missing.size() > 1) throw Failure(kUsage, "export takes one --missing");
  if (!arguments.missing.empty()) style.missing = arguments.missing.front();
  return style;
}

std::vector<std::size_t> chosen_columns(const Columns& all, const Arguments& arguments) {
  std::vector<std::size_t> chosen(arguments.columns.empty() ? all.size() : 0);
  std::iota(chosen.begin(), chosen.end(), std::size_t{0});
  for (const std::string& name :
       split_names(arguments.columns, [&](const std::string& text) { return all.has(text); })) {
    chosen.push_back(all.position_of(name));
  }
  return chosen;
}

void write_field(CsvWriter& writer, const tevpf::RowView& row, std::size_t column, Type type) {
  switch (type) {
    case Type::int32:
      return writer.number(row.get<std::int32_t>(column));
    case Type::int16:
      return writer.number(row.get<std::int16_t>(column));
    case Type::float32:
      return writer.number(row.get<float>(column));
    case Type::float64:
      return writer.number(row.get<double>(column));
    case Type::string:
      return writer.text(row.get<std::string_view>(column));
  }
}

void export_table(CsvWriter& writer, const tevpf::File& file, const tevpf::Table& table,
                  const Arguments& arguments) {
  const Columns all(file, table);
  const std::vector<std::size_t> columns = chosen_columns(all, arguments);
  if (columns.empty()) return;
  if (!arguments.no_header) {
    for (const std::size_t column : columns) writer.text(all[column].name());
    writer.end_record();
  }
  Progress progress("row");
  const double rows = static_cast<double>(table.size());
  std::size_t count = 0;
  for (const tevpf::RowView row : table) {
    for (const std::size_t column : columns) write_field(writer, row, column, all[column].type());
    writer.end_record();
    ++count;
    progress.step(count, [&] { return static_cast<double>(count) / rows; });
  }
}

ExitStatus export_as_json(const Arguments& arguments) {
  const tevpf::File file = open_to_read(arguments.file);
  if (arguments.element.empty()) {
    Output output(arguments.output, path_of(file.name()));
    write_file_json(output, file);
    output.finish();
    return finish_reading(file);
  }
  const tevpf::Element element = find_element(file, arguments.element, arguments.kind());
  Output output(arguments.output, path_of(file.name()));
  write_element_json(output, file, element);
  output.write("\n");
  output.finish();
  return finish_reading(file);
}

}  // namespace

ExitStatus run_export(const Arguments& arguments) {
  if (arguments.json) return export_as_json(arguments);
  if (arguments.element.empty()) {
    throw Failure(kUsage, "CSV is of one list or table, so name it; --json writes the whole file");
  }
  const CsvStyle style = style_of(arguments);
  const tevpf::File file = open_to_read(arguments.file);
  const tevpf::Element element = find_element(file, arguments.element, arguments.kind());
  Output output(arguments.output, path_of(file.name()));
  CsvWriter writer(output, style);
  if (element.kind == tevpf::Kind::list) {
    if (!arguments.columns.empty()) {
      throw Failure(kUsage, in_quotes(element.name) + " is a list; --columns is for tables");
    }
    export_list(writer, file.list(element.name), !arguments.no_header);
  } else {
    export_table(writer, file, file.table(element.name), arguments);
  }
  writer.finish();
  output.finish();
  return finish_reading(file);
}

}  // namespace tool
