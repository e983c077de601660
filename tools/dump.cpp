// tevpf dump: the library's own text dump of a file or an element.
#include <algorithm>
#include <cmath>
#include <optional>
#include <string>
#include <vector>

#include "commands.h"
#include "files.h"
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
double row_bytes(const tevpf::Table& table) {
  static constexpr double kGap = 2, kHeading = 2;
  if (table.empty()) return 0;
  double width = 0;
  for (const tevpf::Column& column : table.columns()) {
    width += std::max<double>(column.width(), static_cast<double>(column.name().size())) + kGap;
  }
  return width * (static_cast<double>(table.size()) + kHeading);
}

void refuse_flood(const tevpf::File& file, const std::vector<tevpf::Element>& elements) {
  double bytes = 0;
  for (const tevpf::Element& element : elements) {
    if (element.kind == tevpf::Kind::table) bytes += row_bytes(file.table(element.name));
  }
  const std::uintmax_t size = size_on_disk(file);
  if (bytes <= std::max(kMostBytes, kMostTimesFile * static_cast<double>(size))) return;
  throw Failure(kRefused, visible(file.name()) + ": a dump of these " + counted(size, "byte") +
                              " would be about " + std::to_string(std::llround(bytes / 1e6)) +
                              " MB, because of the display widths of columns; --force writes it");
}

}  // namespace

ExitStatus run_dump(const Arguments& arguments) {
  const tevpf::File file = open_to_read(arguments.file);
  std::optional<tevpf::Element> element;  // none: the whole file
  if (!arguments.element.empty()) {
    element = find_element(file, arguments.element, arguments.kind());
  }
  if (!arguments.force) {
    refuse_flood(file, element ? std::vector{*element} : file.elements());
  }
  Output output(arguments.output, path_of(file.name()));
  const auto dump = [&](const std::filesystem::path& path) {
    if (!element) {
      file.dump(path);
    } else if (element->kind == tevpf::Kind::list) {
      file.list(element->name).dump(path);
    } else {
      file.table(element->name).dump(path);
    }
  };
  collect(dump, [&](std::string_view text) { output.write(text); });
  output.finish();
  return finish_reading(file);
}

}  // namespace tool
