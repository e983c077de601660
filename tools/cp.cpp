// tevpf cp: copies an element within its file.
#include "commands.h"
#include "messages.h"

namespace tool {

ExitStatus run_cp(const Arguments& arguments) {
  check_new_name(arguments.new_name, "the new name");
  PfFile file = PfFile::open_to_change(arguments.file);
  const Element element = file.find(arguments.element, arguments.kind());
  const auto copy = element.kind == Kind::kList ? TEV8R1_PF_copy_list : TEV8R1_PF_copy_table;
  require(copy(element.name.c_str(), arguments.new_name.c_str()), file.path(), "copy the element");
  file.save();
  return kDone;
}

}  // namespace tool
