// tevpf import: the rows of a CSV file into a table, all of them or none; or the elements of a JSON file.
#include <array>
#include <cstdio>
#include <memory>

#include "commands.h"
#include "files.h"
#include "json_import.h"
#include "platform.h"
#include "table_import.h"
#include "text.h"

namespace tool {
namespace {

struct CloseFile {
  void operator()(std::FILE* stream) const {
    if (stream != stdin) std::fclose(stream);
  }
};

std::string read_whole(const std::string& path) {
  const std::unique_ptr<std::FILE, CloseFile> stream{path == "-" ? stdin
                                                                 : std::fopen(path.c_str(), "rb")};
  std::string text;
  std::array<char, 65536> block;
  while (stream) {
    const std::size_t count = std::fread(block.data(), 1, block.size(), stream.get());
    if (std::ferror(stream.get()) != 0) break;
    text.append(block.data(), count);
    if (count < block.size()) return text;
  }
  throw Failure(kUnreadable, visible(path) + ": it cannot be read: " + last_error().message() +
                                 "; name a CSV file, or - for standard input");
}

ExitStatus import_whole_json(const Arguments& arguments) {
  const Conflict conflict = conflict_named(arguments.on_conflict);
  const std::string& path = arguments.element;  // the one name behind FILE
  if (path.empty() || path.ends_with(".csv")) {
    throw Failure(kUsage, "name a JSON file behind FILE, or a table and a CSV file");
  }
  const std::string text = read_whole(path);
  std::size_t count = 0;
  change_file(arguments.target(), Missing::kMade, [&](tevpf::File& file) {
    count = import_json(file, {text, path == "-" ? "standard input" : path}, conflict);
  });
  report(arguments.target(), counted(count, "element") + " added");
  return kDone;
}

}  // namespace

ExitStatus run_import(const Arguments& arguments) {
  if (arguments.csv.empty()) return import_whole_json(arguments);
  check_new_name(arguments.element, "the table's name");
  const std::string text = read_whole(arguments.csv);
  const std::string name = arguments.csv == "-" ? "standard input" : arguments.csv;
  std::size_t rows = 0;
  change_file(arguments.target(), Missing::kMade, [&](tevpf::File& file) {
    rows = import_csv(file, arguments.element, {text, name});
  });
  report(arguments.target(),
         counted(rows, "row") + " added to table " + in_quotes(arguments.element));
  return kDone;
}

}  // namespace tool
