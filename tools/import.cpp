// tevpf import: the rows of a CSV file into a table, all of them or none; or the elements of a JSON file.
#include "commands.h"
#include "files.h"
#include "input.h"
#include "json_import.h"
#include "table_import.h"
#include "text.h"

namespace tool {
namespace {

ExitStatus import_whole_json(const Arguments& arguments) {
  const Conflict conflict = conflict_named(arguments.on_conflict);
  const std::string& path = arguments.element;  // the one name behind FILE
  if (path.empty() || path.ends_with(".csv")) {
    throw Failure(kUsage, "name a JSON file behind FILE, or a table and a CSV file");
  }
  const std::string text = read_whole(path, "name a JSON file, or - for standard input");
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
  const std::string text = read_whole(arguments.csv, "name a CSV file, or - for standard input");
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
