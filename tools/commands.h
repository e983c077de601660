// The commands: one function each, in a file of its own, and the table that names them.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <vector>

#include "definition_options.h"
#include "failure.h"
#include "files.h"
#include "find.h"
#include "place.h"

namespace tool {

// What the command line said. A command reads the members that its row in the table declares.
struct Arguments : DefinitionOptions, PlaceOptions {
  std::string file, element, csv, output, other, on_conflict = "refuse", changes, statements;
  std::optional<std::string> member, value, new_name, where, to_file;
  std::vector<std::string> columns, sort, cells, with;
  std::size_t from = 0, to = 0;  // 0: not given
  std::optional<std::int32_t> limit;
  // Of CSV.
  std::string delimiter, comment;
  std::vector<std::string> missing, types, widths, defaults;
  std::size_t skip = 0;
  bool no_header = false, fill = false, shorten_names = false, decimal_comma = false, crlf = false;
  std::size_t rows = 1000;
  bool json = false, names = false, list = false, table = false, force = false;
  bool as_csv = false;
  bool count = false, summary = false, wide = false, all = false, no_lock = false;

  Kind kind() const {
    return list ? Kind(tevpf::Kind::list) : table ? Kind(tevpf::Kind::table) : Kind();
  }
  Target target() const { return {file, !no_lock}; }
};

struct Command {
  const char* name;
  const char* help;       // one line
  const char* arguments;  // names from the table in arguments.cpp; [X]: may be left out
  ExitStatus (*run)(const Arguments& arguments);
};

std::span<const Command> commands();

ExitStatus run_add(const Arguments& arguments);
ExitStatus run_check(const Arguments& arguments);
ExitStatus run_cp(const Arguments& arguments);
ExitStatus run_define(const Arguments& arguments);
ExitStatus run_delete(const Arguments& arguments);
ExitStatus run_diff(const Arguments& arguments);
ExitStatus run_dump(const Arguments& arguments);
ExitStatus run_export(const Arguments& arguments);
ExitStatus run_get(const Arguments& arguments);
ExitStatus run_import(const Arguments& arguments);
ExitStatus run_info(const Arguments& arguments);
ExitStatus run_insert(const Arguments& arguments);
ExitStatus run_merge(const Arguments& arguments);
ExitStatus run_mv(const Arguments& arguments);
ExitStatus run_new(const Arguments& arguments);
ExitStatus run_report(const Arguments& arguments);
ExitStatus run_rm(const Arguments& arguments);
ExitStatus run_set(const Arguments& arguments);
ExitStatus run_show(const Arguments& arguments);
ExitStatus run_sql(const Arguments& arguments);
ExitStatus run_update(const Arguments& arguments);

}  // namespace tool
