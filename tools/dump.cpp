// tevpf dump: the library's own text dump of a file or an element.
#include "commands.h"
#include "messages.h"
#include "output.h"

namespace tool {

ExitStatus run_dump(const Arguments& arguments) {
  const PfFile file = PfFile::open_to_read(arguments.file);
  const bool whole_file = arguments.element.empty();
  const Element element = whole_file ? Element{} : file.find(arguments.element, arguments.kind());
  Output output(arguments.output, file.path());
  output.write_file([&](const std::string& path) {
    TEVPF_STATUS status = PF_NORMAL;
    if (whole_file) {
      status = TEV8R1_PF_dump_file(path.c_str());
    } else {
      const auto dump = element.kind == Kind::kList ? TEV8R1_PF_dump_list : TEV8R1_PF_dump_table;
      status = dump(element.name.c_str(), path.c_str());
    }
    require(status, file.path(), "dump it");
  });
  output.finish();
  return finish_reading(file);
}

}  // namespace tool
