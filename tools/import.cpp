// tevpf import: the rows of a CSV file into a table, all of them or none.
#include <filesystem>
#include <system_error>

#include "commands.h"
#include "files.h"
#include "input.h"
#include "output.h"
#include "table_import.h"
#include "text.h"

namespace tool {
namespace {

bool exists(const std::string& path) {
  std::error_code ignored;
  return std::filesystem::symlink_status(path, ignored).type() !=
         std::filesystem::file_type::not_found;
}

// The number of rows added.
std::size_t import_and_save(const std::string& path, const std::string& table, const CsvText& csv) {
  if (exists(path)) {
    tevpf::File file = open_to_change(path);
    const std::size_t rows = import_csv(file, table, csv);
    save(file);
    return rows;
  }
  NewFile made = NewFile::create(path);
  const std::size_t rows = import_csv(made.file(), table, csv);
  made.save();
  return rows;
}

}  // namespace

ExitStatus run_import(const Arguments& arguments) {
  check_new_name(arguments.element, "the table's name");
  const std::string text = read_whole(arguments.csv, "name a CSV file, or - for standard input");
  const std::string name = arguments.csv == "-" ? "standard input" : arguments.csv;
  const std::size_t rows = import_and_save(arguments.file, arguments.element, {text, name});
  const std::string done = counted(rows, "row") + " added to table " + in_quotes(arguments.element);
  try {
    print(done + "\n");
  } catch (const Failure& failure) {
    throw Failure(failure.status(),
                  visible(arguments.file) + " is changed: " + done + "; but " + failure.what());
  }
  return kDone;
}

}  // namespace tool
