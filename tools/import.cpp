// tevpf import: the rows of a CSV file into a table, all of them or none.
#include <array>
#include <cstdio>
#include <filesystem>
#include <memory>
#include <system_error>

#include "commands.h"
#include "files.h"
#include "output.h"
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
  const std::string text = read_whole(arguments.csv);
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
