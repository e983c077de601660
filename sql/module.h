// The virtual-table module "tevpf", and the tables that list what a file holds.
#pragma once

#include <memory>

#include "files.h"
#include "sqlite.h"

namespace sql {

// Adds to a connection:
//   module tevpf(FILE, ELEMENT [, 'list' | 'table'])   for CREATE VIRTUAL TABLE
//   table tevpf_elements(FILE)   name, kind, element, rows, description
//   table tevpf_columns(FILE)    table_name, name, type, units, minimum, maximum, precision, width,
//                                indexed, unique_values, description
// FILE is what `files` finds. Returns SQLite's result code.
int add_modules(sqlite3* connection, const std::shared_ptr<Files>& files);

}  // namespace sql
