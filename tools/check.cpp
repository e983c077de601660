// tevpf check: opens FILE as the library does and says in one sentence how it is.
#include <algorithm>

#include "commands.h"
#include "files.h"
#include "output.h"
#include "text.h"

namespace tool {

ExitStatus run_check(const Arguments& arguments) {
  const tevpf::File file = open_to_read(arguments.file);
  const std::vector<tevpf::Element> elements = file.elements();
  if (file.damage()) {
    throw Failure(kUnreadable, visible(arguments.file) + ": it is damaged: " + damage_of(file) +
                                   "; " + counted(elements.size(), "element") +
                                   " could be read at least in part");
  }
  const auto lists = static_cast<std::size_t>(std::count_if(
      elements.begin(), elements.end(),
      [](const tevpf::Element& element) { return element.kind == tevpf::Kind::list; }));
  print(visible(arguments.file) + ": in order, " + counted(lists, "list") + " and " +
        counted(elements.size() - lists, "table") + "\n");
  return kDone;
}

}  // namespace tool
