// tevpf export: a list or a table as CSV, or JSON of it or of the whole file; both read back exactly.
#include "commands.h"
#include "csv.h"
#include "element_json.h"
#include "files.h"
#include "output.h"
#include "values.h"

namespace tool {
namespace {

constexpr std::string_view kLineEnd = "\r\n";

void export_list(Output& output, const tevpf::List& list) {
  output.write("name,type,value,min,max,precision,units,description\r\n");
  for (const tevpf::Parameter& p : list) {
    std::string row;
    append_csv(row, p.name());
    row += ',';
    row += tevpf::to_string(p.type());
    for (const std::string& field :
         {exact_text(p.value()), p.bounds() ? exact_text(p.bounds()->min) : "",
          p.bounds() ? exact_text(p.bounds()->max) : "",
          is_floating(p.type()) ? std::to_string(p.precision()) : "", p.units(), p.description()}) {
      row += ',';
      append_csv(row, field);
    }
    output.write(row += kLineEnd);
  }
}

void export_table(Output& output, const tevpf::Table& table) {
  const std::vector<tevpf::Column> columns = table.columns();
  const bool is_alone = columns.size() == 1;
  if (columns.empty()) return;
  std::string line;
  for (std::size_t c = 0; c < columns.size(); ++c) {
    if (c > 0) line += ',';
    append_csv(line, columns[c].name(), is_alone);
  }
  output.write(line += kLineEnd);
  for (const tevpf::RowView row : table) {
    line.clear();
    for (std::size_t c = 0; c < columns.size(); ++c) {
      if (c > 0) line += ',';
      append_csv(line, exact_text(row.value(c)), is_alone);
    }
    output.write(line += kLineEnd);
  }
}

ExitStatus export_as_json(const Arguments& arguments) {
  const tevpf::File file = open_to_read(arguments.file);
  if (arguments.element.empty()) {
    Output output(arguments.output, file.name());
    write_file_json(output, file);
    output.finish();
    return finish_reading(file);
  }
  const tevpf::Element element = find_element(file, arguments.element, arguments.kind());
  Output output(arguments.output, file.name());
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
  const tevpf::File file = open_to_read(arguments.file);
  const tevpf::Element element = find_element(file, arguments.element, arguments.kind());
  Output output(arguments.output, file.name());
  if (element.kind == tevpf::Kind::list) {
    export_list(output, file.list(element.name));
  } else {
    export_table(output, file.table(element.name));
  }
  output.finish();
  return finish_reading(file);
}

}  // namespace tool
