// The commands: one function each, in a file of its own, and the table that names them.
#pragma once

#include <cstddef>
#include <span>
#include <string>
#include <vector>

#include "failure.h"
#include "find.h"

namespace tool {

// What the command line said. A command reads the members that its row in the table declares.
struct Arguments {
  std::string file, element, parameter, value, new_name, csv, output, sort, statements;
  std::vector<std::string> columns, with;
  std::size_t from = 0, to = 0;  // 0: not given
  bool json = false, names = false, list = false, table = false, force = false;
  bool as_csv = false;

  Kind kind() const {
    return list ? Kind(tevpf::Kind::list) : table ? Kind(tevpf::Kind::table) : Kind();
  }
};

struct Command {
  const char* name;
  const char* help;       // one line
  const char* arguments;  // names from the table in arguments.cpp; [X]: may be left out
  ExitStatus (*run)(const Arguments& arguments);
};

std::span<const Command> commands();

ExitStatus run_check(const Arguments& arguments);
ExitStatus run_cp(const Arguments& arguments);
ExitStatus run_dump(const Arguments& arguments);
ExitStatus run_export(const Arguments& arguments);
ExitStatus run_get(const Arguments& arguments);
ExitStatus run_import(const Arguments& arguments);
ExitStatus run_info(const Arguments& arguments);
ExitStatus run_mv(const Arguments& arguments);
ExitStatus run_new(const Arguments& arguments);
ExitStatus run_rm(const Arguments& arguments);
ExitStatus run_set(const Arguments& arguments);
ExitStatus run_show(const Arguments& arguments);
ExitStatus run_sql(const Arguments& arguments);

}  // namespace tool
