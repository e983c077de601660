// tevpf check: opens FILE as the library does and says in one sentence how it is.
#include <algorithm>

#include "commands.h"
#include "elements.h"
#include "output.h"
#include "text.h"

namespace tool {

ExitStatus run_check(const Arguments& arguments) {
  const PfFile file = PfFile::open_to_read(arguments.file);
  const std::vector<Element> elements = file.elements();
  if (!file.damage().empty()) {
    throw Failure(kUnreadable, visible(file.path()) + ": it is damaged: " + file.damage() + "; " +
                                   counted(elements.size(), "element") +
                                   " could be read at least in part");
  }
  const auto lists = static_cast<std::size_t>(
      std::count_if(elements.begin(), elements.end(),
                    [](const Element& element) { return element.kind == Kind::kList; }));
  print(visible(file.path()) + ": in order, " + counted(lists, "list") + " and " +
        counted(elements.size() - lists, "table") + "\n");
  return kDone;
}

}  // namespace tool
