// tevpf export: a list or a table as CSV that reads back exactly.
#include "commands.h"
#include "csv.h"
#include "elements.h"
#include "output.h"

namespace tool {
namespace {

constexpr std::string_view kLineEnd = "\r\n";

void export_list(Output& output, const std::vector<Parameter>& parameters) {
  output.write("name,type,value,min,max,precision,units,description\r\n");
  for (const Parameter& p : parameters) {
    std::string row;
    append_csv(row, p.name);
    row += ',';
    row += type_word(p.type);
    for (const std::string& field :
         {exact_text(p.value), p.bounds ? exact_text(p.bounds->min) : "",
          p.bounds ? exact_text(p.bounds->max) : "",
          is_floating(p.type) ? std::to_string(p.precision) : "", p.units, p.description}) {
      row += ',';
      append_csv(row, field);
    }
    output.write(row += kLineEnd);
  }
}

void export_table(Output& output, Table& table) {
  const std::size_t count = table.columns().size();
  if (count == 0) return;
  std::string row;
  for (std::size_t c = 0; c < count; ++c) {
    if (c > 0) row += ',';
    append_csv(row, table.columns()[c].name, count == 1);
  }
  output.write(row += kLineEnd);
  for (std::size_t r = 0; r < table.row_count(); ++r) {
    table.read_row(r);
    row.clear();
    for (std::size_t c = 0; c < count; ++c) {
      if (c > 0) row += ',';
      append_csv(row, exact_text(table.cell(c)), count == 1);
    }
    output.write(row += kLineEnd);
  }
}

}  // namespace

ExitStatus run_export(const Arguments& arguments) {
  const PfFile file = PfFile::open_to_read(arguments.file);
  const Element element = file.find(arguments.element, arguments.kind());
  Output output(arguments.output, file.path());
  if (element.kind == Kind::kList) {
    export_list(output, read_list(file, element.name));
  } else {
    Table table(file, element.name);
    export_table(output, table);
  }
  output.finish();
  return finish_reading(file);
}

}  // namespace tool
