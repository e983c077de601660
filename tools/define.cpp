// tevpf define: a column of a table, new or changed, or a new empty table.
#include "column_change.h"
#include "commands.h"
#include "made.h"
#include "text.h"

namespace tool {
namespace {

void define(tevpf::File& file, tevpf::Table& table, const Arguments& arguments) {
  if (!arguments.member) {
    if (arguments.description) table.describe(*arguments.description);
    return;
  }
  const std::string& name = *arguments.member;
  Subject subject{visible(file.name()) + ": column " + in_quotes(name) + " of table " +
                      in_quotes(arguments.element),
                  "stays as it is"};
  if (table.has_column(name)) {
    change_column(table, name, arguments, subject);
  } else {
    check_new_name(name, "the column's name");
    subject.outcome = "is not defined";
    add_column(table, name, arguments, subject);
  }
  if (arguments.PlaceOptions::is_given()) move_to(table, name, arguments, subject);
}

void check_request(const Arguments& arguments) {
  check_new_name(arguments.element, "the table's name");
  if (arguments.member) return;
  DefinitionOptions others = arguments;
  others.description.reset();
  if (others.defines_anything() || arguments.PlaceOptions::is_given()) {
    throw Failure(kUsage, "without a column, only --description has a meaning");
  }
}

}  // namespace

ExitStatus run_define(const Arguments& arguments) {
  check_request(arguments);
  Made made;
  made.file = change_file(arguments.target(), Missing::kMade, [&](tevpf::File& file) {
    std::optional<tevpf::Table> table = file.find_table(arguments.element);
    made.element = !table;
    if (!table) table = file.create_table(arguments.element);
    define(file, *table, arguments);
  });
  report_made(arguments, made, "table");
  return kDone;
}

}  // namespace tool
