#include "made.h"

#include "text.h"

namespace tool {

void report_made(const Arguments& arguments, const Made& made, const char* kind) {
  if (!made.file && !made.element) return;
  const std::string element = std::string(kind) + " " + in_quotes(arguments.element);
  report(arguments.target(),
         "made " + (made.file ? visible(arguments.file) + " with " + element : element));
}

}  // namespace tool
