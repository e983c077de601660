// tevpf import: the rows of a CSV file into a table, or its parameters into a list; all of them or
// none.
#include <filesystem>
#include <system_error>

#include "commands.h"
#include "csv_source.h"
#include "files.h"
#include "import_options.h"
#include "list_csv.h"
#include "output.h"
#include "platform.h"
#include "progress.h"
#include "table_import.h"
#include "text.h"

namespace tool {
namespace {

bool exists(const std::string& path) {
  std::error_code ignored;
  return std::filesystem::symlink_status(path, ignored).type() !=
         std::filesystem::file_type::not_found;
}

class Import {
 public:
  Import(const Arguments& arguments)
      : path_(arguments.file),
        name_(arguments.element),
        options_(import_options(arguments)),
        source_(arguments.csv) {}

  // What was done: "3 rows added to table 't'".
  std::string run() {
    if (!exists(path_)) {
      NewFile made = NewFile::create(path_);
      std::string done = import_into(made.file(), Indexes::kAtOnce);
      progress_.clear();
      made.save();
      return done;
    }
    try {
      return import_and_save(Indexes::kAtOnce);
    } catch (const IndexesRefused&) {
      source_.start_over();
      return import_and_save(Indexes::kRowByRow);
    }
  }

 private:
  std::string import_and_save(Indexes indexes) {
    tevpf::File file = open_to_change(path_);
    std::string done = import_into(file, indexes);
    progress_.clear();
    save(file);
    return done;
  }

  std::string import_into(tevpf::File& file, Indexes indexes) {
    if (is_list(file)) {
      return counted(import_parameters(file, name_, source_, options_), "parameter") +
             " added to list " + in_quotes(name_);
    }
    return counted(import_rows(file, name_, source_, options_, indexes, progress_), "row") +
           " added to table " + in_quotes(name_);
  }

  // An exported list becomes one again, unless there is a table to add its lines to.
  bool is_list(const tevpf::File& file) {
    if (options_.kind) return *options_.kind == tevpf::Kind::list;
    const bool has_list = file.find_list(name_).has_value();
    const bool has_table = file.find_table(name_).has_value();
    if ((has_list || !has_table) && is_exported_list(source_, options_)) return true;
    if (!has_list || has_table) return false;
    throw Failure(kRefused, visible(file.name()) + ": " + in_quotes(name_) +
                                " is a list; rows go into tables, so choose another name");
  }

  std::string path_, name_;
  ImportOptions options_;
  CsvSource source_;
  Progress progress_{"row"};
};

}  // namespace

ExitStatus run_import(const Arguments& arguments) {
  check_new_name(arguments.element, arguments.list ? "the list's name" : "the table's name");
  const std::string done = Import(arguments).run();
  try {
    print(done + "\n");
  } catch (const Failure& failure) {
    throw Failure(failure.status(),
                  visible(arguments.file) + " is changed: " + done + "; but " + failure.what());
  }
  return kDone;
}

}  // namespace tool
