// tevpf mv: renames an element, or renames or moves a parameter or a column.
#include "commands.h"
#include "text.h"

namespace tool {
namespace {

void rename_element(tevpf::File& file, const tevpf::Element& element, const std::string& name) {
  if (element.kind == tevpf::Kind::list) {
    file.list(element.name).rename_list(name);
  } else {
    file.table(element.name).rename_table(name);
  }
}

// The name that the member has afterwards.
const std::string& rename_member(tevpf::List& list, const std::string& member,
                                 const std::optional<std::string>& name) {
  if (!name || *name == member) return member;
  list.rename(member, *name);
  return *name;
}

const std::string& rename_member(tevpf::Table& table, const std::string& member,
                                 const std::optional<std::string>& name) {
  if (!name || *name == member) return member;
  table.redefine(member, table.definition(member).name(*name));
  return *name;
}

template <class Owner>
void change_member(Owner owner, const Arguments& arguments, const Subject& subject) {
  const std::string& name = rename_member(owner, *arguments.member, arguments.new_name);
  if (arguments.PlaceOptions::is_given()) move_to(owner, name, arguments, subject);
}

void change_member(tevpf::File& file, const tevpf::Element& element, const Arguments& arguments) {
  const Subject subject{
      visible(file.name()) + ": " + in_quotes(*arguments.member) + " of " + in_quotes(element.name),
      "stays as it is"};
  if (element.kind == tevpf::Kind::list) {
    find_parameter(file, element.name, *arguments.member);
    change_member(file.list(element.name), arguments, subject);
  } else {
    const tevpf::Table table = file.table(element.name);
    static_cast<void>(Columns(file, table).position_of(*arguments.member));
    change_member(table, arguments, subject);
  }
}

}  // namespace

ExitStatus run_mv(const Arguments& arguments) {
  // One name behind the element is its new one, unless a place is given.
  const bool is_element = !arguments.new_name && !arguments.PlaceOptions::is_given();
  if (!arguments.member) {
    throw Failure(kUsage, "the new name is not given; 'tevpf mv --help' shows how to call it");
  }
  if (is_element) check_new_name(*arguments.member, "the new name");
  if (arguments.new_name) check_new_name(*arguments.new_name, "the new name");
  change_file(arguments.target(), Missing::kRefused, [&](tevpf::File& file) {
    const tevpf::Element element = find_element(file, arguments.element, arguments.kind());
    is_element ? rename_element(file, element, *arguments.member)
               : change_member(file, element, arguments);
  });
  return kDone;
}

}  // namespace tool
