// tevpf get: the value of one parameter, exactly, and nothing else.
#include "commands.h"
#include "elements.h"
#include "output.h"
#include "platform.h"
#include "text.h"

namespace tool {

ExitStatus run_get(const Arguments& arguments) {
  const PfFile file = PfFile::open_to_read(arguments.file);
  const Element element = file.find(arguments.element, Kind::kList);
  const std::string value =
      exact_text(find_parameter(file, element.name, arguments.parameter).value);
  // A script gets the very bytes; a terminal must not act upon them.
  print((is_terminal(stdout) ? visible(value) : value) + "\n");
  return finish_reading(file);
}

}  // namespace tool
