// tevpf report: FILE as one page of HTML.
#include "commands.h"
#include "files.h"
#include "output.h"
#include "platform.h"
#include "report_page.h"

namespace tool {

ExitStatus run_report(const Arguments& arguments) {
  const tevpf::File file = open_to_read(arguments.file);
  Output output(arguments.output, path_of(file.name()));
  write_page(output, file, arguments.rows);
  output.finish();
  return finish_reading(file);
}

}  // namespace tool
