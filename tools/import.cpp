// tevpf import: the rows of a CSV file into a table, or its parameters into a list, all of them or
// none; or the elements of a JSON file.
#include <utility>

#include "commands.h"
#include "csv_source.h"
#include "files.h"
#include "import_options.h"
#include "input.h"
#include "json_import.h"
#include "list_csv.h"
#include "progress.h"
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

class Import {
 public:
  Import(const Arguments& arguments)
      : target_(arguments.target()),
        name_(arguments.element),
        options_(import_options(arguments)),
        source_(arguments.csv) {}

  // What was done: "3 rows added to table 't'".
  std::string run() {
    try {
      return run_with(Indexes::kAtOnce);
    } catch (const IndexesRefused&) {
      return run_with(Indexes::kRowByRow);
    }
  }

 private:
  std::string run_with(Indexes indexes) {
    std::string done;
    bool is_first = true;
    change_file(target_, Missing::kMade, [&](tevpf::File& file) {
      if (!std::exchange(is_first, false) || indexes == Indexes::kRowByRow) source_.start_over();
      done = import_into(file, indexes);
      progress_.clear();
    });
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

  Target target_;
  std::string name_;
  ImportOptions options_;
  CsvSource source_;
  Progress progress_{"row"};
};

}  // namespace

ExitStatus run_import(const Arguments& arguments) {
  if (arguments.csv.empty()) return import_whole_json(arguments);
  check_new_name(arguments.element, arguments.list ? "the list's name" : "the table's name");
  report(arguments.target(), Import(arguments).run());
  return kDone;
}

}  // namespace tool
