// The virtual-table module "tevpf", and the tables that list what a file holds.
#pragma once

#include <functional>
#include <memory>
#include <string>

#include "shared_file.h"
#include "sqlite.h"

namespace sql {

// Where the files that SQL names come from.
struct Files {
  // Called with the library locked; throws Refusal.
  std::function<std::shared_ptr<SharedFile>(const std::string& name)> find;
  // What tevpf_elements and tevpf_columns list when no file is named; empty: one must be named.
  std::string usual;
};

// Adds to a connection:
//   module tevpf(FILE, ELEMENT [, 'list' | 'table'])   for CREATE VIRTUAL TABLE
//   table tevpf_elements(FILE)   name, kind, element, rows, description
//   table tevpf_columns(FILE)    table_name, name, type, units, minimum, maximum, precision, width,
//                                indexed, unique_values, description
// FILE is what `files` finds. Returns SQLite's result code.
int add_modules(sqlite3* connection, const std::shared_ptr<Files>& files);

}  // namespace sql
