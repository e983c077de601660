// tevpf set: changes a parameter's value within its bounds, its definition, or that of a column; and
// the description of a list or a table.
#include "column_change.h"
#include "commands.h"
#include "text.h"

namespace tool {
namespace {

Subject subject_of(const tevpf::File& file, const tevpf::Element& element,
                   const std::string& member) {
  const bool is_list = element.kind == tevpf::Kind::list;
  return {visible(file.name()) + ": " + (is_list ? "" : "column ") + in_quotes(member) + " of " +
              (is_list ? "list " : "table ") + in_quotes(element.name),
          "stays as it is"};
}

void set_parameter(tevpf::File& file, const tevpf::Element& element, const Arguments& arguments) {
  const tevpf::Parameter before = find_parameter(file, element.name, *arguments.member);
  const Subject subject = subject_of(file, element, before.name());
  if (arguments.defines_column_only()) {
    subject.refuse("--width, --index and --unique are for columns, and it is a parameter");
  }
  tevpf::List list = file.list(element.name);
  const tevpf::Parameter now =
      define_parameter(before.name(), &before, arguments.value, arguments, subject);
  if (arguments.defines_parameter()) {
    list.redefine(now);
  } else if (arguments.value) {
    list.set(before.name(), now.value());
  }
  if (arguments.PlaceOptions::is_given()) move_to(list, before.name(), arguments, subject);
}

void set_column(tevpf::File& file, const tevpf::Element& element, const Arguments& arguments) {
  tevpf::Table table = file.table(element.name);
  const Columns columns(file, table);
  const std::string& name = columns[columns.position_of(*arguments.member)].name();
  const Subject subject = subject_of(file, element, name);
  if (arguments.value) {
    subject.refuse("a column has no value of its own; 'tevpf update' changes what rows hold");
  }
  change_column(table, name, arguments, subject);
  if (arguments.PlaceOptions::is_given()) move_to(table, name, arguments, subject);
}

void describe(tevpf::File& file, const tevpf::Element& element, const std::string& description) {
  if (element.kind == tevpf::Kind::list) {
    file.list(element.name).describe(description);
  } else {
    file.table(element.name).describe(description);
  }
}

void check_request(const Arguments& arguments) {
  const bool has_place = arguments.PlaceOptions::is_given();
  if (!arguments.value && !arguments.defines_anything() && !has_place) {
    throw Failure(kUsage, "nothing to set is given; 'tevpf set --help' shows what there is");
  }
  DefinitionOptions others = arguments;
  others.description.reset();
  if (!arguments.member && (others.defines_anything() || has_place)) {
    throw Failure(kUsage, "without a parameter or a column, only --description has a meaning");
  }
}

}  // namespace

ExitStatus run_set(const Arguments& arguments) {
  check_request(arguments);
  change_file(arguments.target(), Missing::kRefused, [&](tevpf::File& file) {
    // Only parameters have values.
    const Kind kind = arguments.value && !arguments.table ? tevpf::Kind::list : arguments.kind();
    const tevpf::Element element = find_element(file, arguments.element, kind);
    if (!arguments.member) return describe(file, element, *arguments.description);
    element.kind == tevpf::Kind::list ? set_parameter(file, element, arguments)
                                      : set_column(file, element, arguments);
  });
  return kDone;
}

}  // namespace tool
