// tevpf rm: removes an element with everything it holds.
#include "commands.h"
#include "messages.h"

namespace tool {

ExitStatus run_rm(const Arguments& arguments) {
  PfFile file = PfFile::open_to_change(arguments.file);
  const Element element = file.find(arguments.element, arguments.kind());
  const auto remove = element.kind == Kind::kList ? TEV8R1_PF_delete_list : TEV8R1_PF_delete_table;
  require(remove(element.name.c_str()), file.path(), "remove the element");
  file.save();
  return kDone;
}

}  // namespace tool
