// The tables tevpf_elements and tevpf_columns: what a file holds, under the names that it has in SQL.
#pragma once

#include "sqlite.h"

namespace sql {

// Their client data is a std::shared_ptr<Files>*.
const sqlite3_module* elements_module();
const sqlite3_module* columns_module();

}  // namespace sql
