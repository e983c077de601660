// tevpf rm: removes an element with everything it holds, or a parameter or a column of it.
#include "commands.h"

namespace tool {
namespace {

void remove_element(tevpf::File& file, const tevpf::Element& element) {
  if (element.kind == tevpf::Kind::list) {
    file.remove_list(element.name);
  } else {
    file.remove_table(element.name);
  }
}

void remove_member(tevpf::File& file, const tevpf::Element& element, const std::string& member) {
  if (element.kind == tevpf::Kind::list) {
    file.list(element.name).remove(find_parameter(file, element.name, member).name());
  } else {
    tevpf::Table table = file.table(element.name);
    static_cast<void>(Columns(file, table).position_of(member));
    table.remove_column(member);
  }
}

}  // namespace

ExitStatus run_rm(const Arguments& arguments) {
  change_file(arguments.target(), Missing::kRefused, [&](tevpf::File& file) {
    const tevpf::Element element = find_element(file, arguments.element, arguments.kind());
    arguments.member ? remove_member(file, element, *arguments.member)
                     : remove_element(file, element);
  });
  return kDone;
}

}  // namespace tool
