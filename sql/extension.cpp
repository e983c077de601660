// The module as a loadable extension: .load tevpf_sqlite
#include <memory>
#include <new>

#include "module.h"

const sqlite3_api_routines* sqlite3_api = nullptr;

// The entry point that SQLite derives from the name of the file.
extern "C" __attribute__((visibility("default"))) int sqlite3_tevpfsqlite_init(
    sqlite3* connection, char**, const sqlite3_api_routines* api) {
  sqlite3_api = api;
  try {
    const auto files = std::make_shared<sql::Files>();
    files->find = [](const std::string& path) { return sql::SharedFile::open(path); };
    return sql::add_modules(connection, files);
  } catch (const std::bad_alloc&) {
    return SQLITE_NOMEM;
  }
}
