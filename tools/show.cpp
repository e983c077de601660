// tevpf show: a list or a table for people (aligned text) or programs (JSON).
#include <optional>

#include "commands.h"
#include "element_json.h"
#include "output.h"
#include "platform.h"
#include "selection.h"
#include "summary.h"
#include "text.h"
#include "text_table.h"
#include "values.h"

namespace tool {
namespace {

using Align = TextTable::Align;

void show_list(Output& output, const tevpf::List& list, bool wide) {
  std::vector<tevpf::Parameter> parameters;
  for (const tevpf::Parameter& p : list) parameters.push_back(p);
  TextTable text;
  for (const char* heading : {"name", "value", "units", "bounds", "description"}) {
    text.add_column(heading, Align::kLeft);
  }
  if (!wide) text.fit(output.line_width());
  text.write(output, parameters.size(), [&](std::size_t row, std::size_t column) {
    const tevpf::Parameter& p = parameters[row];
    switch (column) {
      case 0:
        return p.name();
      case 1:
        return display_text(p.value(), p.precision());
      case 2:
        return p.units();
      case 3:
        return bounds_text(p.bounds(), {});
      default:
        return p.description();
    }
  });
}

void show_table(Output& output, const tevpf::Table& table, const Selection& selection, bool wide) {
  TextTable text;
  for (const std::size_t column : selection.columns) {
    const tevpf::Column& c = selection.all[column];
    text.add_column(c.units().empty() ? c.name() : c.name() + " [" + c.units() + "]",
                    c.type() == Type::string ? Align::kLeft : Align::kRight);
  }
  if (!wide) text.fit(output.line_width());
  std::optional<tevpf::Row> current;
  text.write(output, selection.rows.size(), [&](std::size_t row, std::size_t i) {
    if (i == 0) current = table.row(selection.rows[row]);
    const std::size_t column = selection.columns[i];
    return display_text(current->value(column), selection.all[column].precision());
  });
}

void show_rows(Output& output, tevpf::File& file, const tevpf::Element& element,
               const Arguments& arguments) {
  const Selection selection = select(file, element, arguments);
  const tevpf::Table table = file.table(element.name);
  if (arguments.count) {
    output.write(std::to_string(selection.rows.size()) + "\n");
  } else if (arguments.summary) {
    show_summary(output, table, selection, arguments.json);
  } else if (arguments.json) {
    write_table_json(output, table, element, selection.all, selection.columns, selection.rows);
    output.write("\n");
  } else {
    show_table(output, table, selection, arguments.wide);
  }
}

void show_parameters(Output& output, const tevpf::List& list, const tevpf::Element& element,
                     const Arguments& arguments) {
  if (!arguments.columns.empty() || !arguments.sort.empty() || arguments.from != 0 ||
      arguments.to != 0 || arguments.where || arguments.limit || arguments.count ||
      arguments.summary) {
    throw Failure(kUsage, in_quotes(arguments.element) +
                              " is a list; --columns, --where, --sort, --from, --to, --limit, "
                              "--count and --summary are for tables");
  }
  if (!arguments.json) return show_list(output, list, arguments.wide);
  write_list_json(output, list, element);
  output.write("\n");
}

}  // namespace

ExitStatus run_show(const Arguments& arguments) {
  tevpf::File file = open_to_read(arguments.file);
  const tevpf::Element element = find_element(file, arguments.element, arguments.kind());
  Output output({}, path_of(file.name()));
  if (element.kind == tevpf::Kind::list) {
    show_parameters(output, file.list(element.name), element, arguments);
  } else {
    show_rows(output, file, element, arguments);
  }
  output.finish();
  return finish_reading(file);
}

}  // namespace tool
