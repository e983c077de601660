// tevpf dump: the library's own text dump of a file or an element.
#include <algorithm>
#include <cmath>
#include <string>

#include "commands.h"
#include "elements.h"
#include "messages.h"
#include "output.h"
#include "platform.h"
#include "text.h"

namespace tool {
namespace {

// Rows are padded to the display widths of their columns, which a file sets as it likes. What is
// longer than this has more blanks in it than anybody wants to read.
constexpr double kMostBytes = 16e6;
constexpr double kMostTimesFile = 100;

// About the bytes that a dump takes for a table's rows and the two lines above them. Definitions
// and lists take a few times what they take in the file.
double row_bytes(const Table& table) {
  static constexpr double kGap = 2, kHeading = 2;
  if (table.row_count() == 0) return 0;
  double width = 0;
  for (const Column& column : table.columns()) {
    width += std::max<double>(column.width, static_cast<double>(column.name.size())) + kGap;
  }
  return width * (static_cast<double>(table.row_count()) + kHeading);
}

void refuse_flood(const PfFile& file, const std::vector<Element>& elements) {
  double bytes = 0;
  for (const Element& element : elements) {
    if (element.kind == Kind::kTable) bytes += row_bytes(Table(file, element.name));
  }
  if (bytes <= std::max(kMostBytes, kMostTimesFile * static_cast<double>(file.size()))) return;
  throw Failure(kRefused, visible(file.path()) + ": a dump of these " +
                              counted(file.size(), "byte") + " would be about " +
                              std::to_string(std::llround(bytes / 1e6)) +
                              " MB, because of the display widths of columns; --force writes it");
}

}  // namespace

ExitStatus run_dump(const Arguments& arguments) {
  const PfFile file = PfFile::open_to_read(arguments.file);
  const bool whole_file = arguments.element.empty();
  const Element element = whole_file ? Element{} : file.find(arguments.element, arguments.kind());
  if (!arguments.force) {
    refuse_flood(file, whole_file ? file.elements() : std::vector<Element>{element});
  }
  Output output(arguments.output, file.path());
  const auto dump = [&](const std::string& path) {
    TEVPF_STATUS status = PF_NORMAL;
    if (whole_file) {
      status = TEV8R1_PF_dump_file(path.c_str());
    } else {
      const auto dump_one =
          element.kind == Kind::kList ? TEV8R1_PF_dump_list : TEV8R1_PF_dump_table;
      status = dump_one(element.name.c_str(), path.c_str());
    }
    require(status, file.path(), "dump it");
  };
  collect(dump, [&](std::string_view text) { output.write(text); });
  output.finish();
  return finish_reading(file);
}

}  // namespace tool
