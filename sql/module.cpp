#include "module.h"

#include <new>
#include <string_view>
#include <utility>
#include <vector>

#include "catalog.h"
#include "guard.h"

namespace sql {
namespace {

// A table of SQL that stands for a list or a table of a file.
struct Link : sqlite3_vtab {
  Link() : sqlite3_vtab{} {}

  Connection connection = nullptr;
  std::shared_ptr<SharedFile> file;
  tevpf::Kind kind{};
  std::string name, declaration;
  std::shared_ptr<Relation> relation;
  std::uint64_t generation = 0;    // of the file when the relation was found
  std::vector<std::size_t> marks;  // by savepoint: changes of the file when it was set

  // SQLite ends the transaction of CREATE VIRTUAL TABLE here as well, but does not begin it: what is
  // done with a table that is as new as this is noted by itself.
  bool is_new = false;
  bool writes = false;           // takes part in the file's transaction
  bool reads_until_end = false;  // new, and read: what was read stays until it is written

  // The relation as it is now, after the file may have been read again.
  Relation& current() {
    if (relation == nullptr || generation != file->generation()) {
      relation = file->relation(kind, name);
      generation = file->generation();
      if (declaration.empty()) declaration = relation->declaration();
      if (relation->declaration() != declaration) {
        relation = nullptr;
        throw Refusal(SQLITE_SCHEMA,
                      "the columns of '" + name + "' have changed: open the database again");
      }
    }
    return *relation;
  }

  void begin_reading(Lock& lock) {
    if (!is_new || reads_until_end) return;
    file->begin_reading(connection, lock);
    reads_until_end = true;
  }
  void begin_writing(Lock& lock) {
    if (writes) return;
    file->begin_writing(connection, lock);
    writes = true;
  }
  // The transaction is over. True if it is to be ended for the file.
  bool end() noexcept {
    is_new = false;
    if (std::exchange(reads_until_end, false)) file->end_reading(connection);
    return std::exchange(writes, false);
  }
};

struct Read : sqlite3_vtab_cursor {
  Read() : sqlite3_vtab_cursor{} {}

  std::shared_ptr<Relation> relation;  // that the cursor reads
  std::unique_ptr<Cursor> cursor;
  bool is_active = false;  // counted as a reader of the file
};

Link& link_of(sqlite3_vtab* table) { return *static_cast<Link*>(table); }
Read& read_of(sqlite3_vtab_cursor* cursor) { return *static_cast<Read*>(cursor); }

template <class Function>
int locked(sqlite3_vtab* table, Function function) noexcept {
  return guarded(&table->zErrMsg, [&] {
    Lock lock(library_mutex());
    function(link_of(table), lock);
  });
}

// ---- Linking ------------------------------------------------------------------------------------

// An argument of CREATE VIRTUAL TABLE, out of its quotes.
std::string unquoted(std::string_view text) {
  if (text.size() < 2 || (text[0] != '\'' && text[0] != '"')) return std::string(text);
  const char quote = text[0];
  std::string result;
  for (std::size_t i = 1; i + 1 < text.size(); ++i) {
    result += text[i];
    if (text[i] == quote) ++i;
  }
  return result;
}

tevpf::Kind kind_of(const SharedFile& file, const tevpf::File& opened, const std::string& name,
                    const std::string& kind) {
  if (kind == "list") return tevpf::Kind::list;
  if (kind == "table") return tevpf::Kind::table;
  if (!kind.empty()) throw Refusal(SQLITE_ERROR, "'" + kind + "' is neither 'list' nor 'table'");
  const bool is_table = opened.find_table(name).has_value();
  const bool is_list = opened.find_list(name).has_value();
  if (is_table && is_list) {
    throw Refusal(SQLITE_ERROR, "both a list and a table are named '" + name +
                                    "': add 'list' or 'table' as the third argument");
  }
  if (!is_table && !is_list) {
    throw Refusal(SQLITE_ERROR, "'" + file.name() + "' has no list or table '" + name + "'");
  }
  return is_table ? tevpf::Kind::table : tevpf::Kind::list;
}

int connect(sqlite3* connection, void* files, int argc, const char* const* argv,
            sqlite3_vtab** table_out, char** message) {
  return guarded(message, [&] {
    if (argc < 5 || argc > 6) {
      throw Refusal(SQLITE_ERROR,
                    "write tevpf('FILE', 'ELEMENT'), or with 'list' or 'table' behind");
    }
    Lock lock(library_mutex());
    auto link = std::make_unique<Link>();
    link->connection = connection;
    link->file = (*static_cast<std::shared_ptr<Files>*>(files))->find(unquoted(argv[3]));
    link->name = unquoted(argv[4]);
    link->kind = kind_of(*link->file, link->file->file(), link->name,
                         argc == 6 ? unquoted(argv[5]) : std::string());
    link->current();
    if (sqlite3_declare_vtab(connection, link->declaration.c_str()) != SQLITE_OK) {
      throw Refusal(SQLITE_ERROR, "'" + link->name + "': " + sqlite3_errmsg(connection));
    }
    sqlite3_vtab_config(connection, SQLITE_VTAB_CONSTRAINT_SUPPORT, 1);
    *table_out = link.release();
  });
}

// A function of its own: were it the same as connect, the module would be a table, too.
int create(sqlite3* connection, void* files, int argc, const char* const* argv,
           sqlite3_vtab** table_out, char** message) {
  const int result = connect(connection, files, argc, argv, table_out, message);
  if (result == SQLITE_OK) link_of(*table_out).is_new = true;
  return result;
}

int disconnect(sqlite3_vtab* table) {
  const Lock lock(library_mutex());
  Link& link = link_of(table);
  if (link.end()) link.file->rollback();
  delete &link;
  return SQLITE_OK;
}

// The element stays in its file. SQLite would not commit what this table has changed before.
int destroy(sqlite3_vtab* table) {
  if (Lock lock(library_mutex()); link_of(table).writes) return SQLITE_LOCKED;
  return disconnect(table);
}

// ---- Reading ------------------------------------------------------------------------------------

int best_index(sqlite3_vtab* table, sqlite3_index_info* info) {
  return locked(table, [&](Link& link, Lock&) { link.current().plan(*info); });
}

int open_cursor(sqlite3_vtab* table, sqlite3_vtab_cursor** cursor_out) {
  return guarded(&table->zErrMsg, [&] { *cursor_out = new Read; });
}

void end_reading(Read& read) noexcept {
  if (std::exchange(read.is_active, false)) {
    Link& link = link_of(read.pVtab);
    link.file->end_reading(link.connection);
  }
}

int close_cursor(sqlite3_vtab_cursor* cursor) {
  const Lock lock(library_mutex());
  end_reading(read_of(cursor));
  delete &read_of(cursor);
  return SQLITE_OK;
}

int filter(sqlite3_vtab_cursor* cursor, int plan, const char*, int argc, sqlite3_value** argv) {
  return locked(cursor->pVtab, [&](Link& link, Lock& lock) {
    Read& read = read_of(cursor);
    link.begin_reading(lock);
    if (!read.is_active) {
      link.file->begin_reading(link.connection, lock);
      read.is_active = true;
    }
    Relation& relation = link.current();
    if (read.relation != link.relation) {
      read.cursor = relation.open();
      read.relation = link.relation;
    }
    read.cursor->filter(plan, {argv, static_cast<std::size_t>(argc)});
    if (read.cursor->at_end()) end_reading(read);
  });
}

int next(sqlite3_vtab_cursor* cursor) {
  Read& read = read_of(cursor);
  if (read.cursor->step()) return SQLITE_OK;
  return locked(cursor->pVtab, [&](Link&, Lock&) {
    read.cursor->advance();
    if (read.cursor->at_end()) end_reading(read);
  });
}

int at_end(sqlite3_vtab_cursor* cursor) { return read_of(cursor).cursor->at_end() ? 1 : 0; }

// The columns that an UPDATE leaves alone are not read; Relation::update sees which.
int column(sqlite3_vtab_cursor* cursor, sqlite3_context* context, int column) {
  if (sqlite3_vtab_nochange(context) == 0) read_of(cursor).cursor->deliver(context, column);
  return SQLITE_OK;
}

int row_id(sqlite3_vtab_cursor* cursor, sqlite3_int64* id_out) {
  *id_out = read_of(cursor).cursor->id();
  return SQLITE_OK;
}

// ---- Changing -----------------------------------------------------------------------------------

void check_id_is_left_out(sqlite3_value* id) {
  if (sqlite3_value_type(id) == SQLITE_NULL) return;
  throw Refusal(SQLITE_CONSTRAINT,
                "the rowid follows from the place of the row and cannot be given");
}

// SQLite's protocol: one value deletes, the first one being NULL inserts, else they update.
void change(Link& link, int argc, sqlite3_value** argv, sqlite3_int64* id_out) {
  Relation& relation = link.current();
  if (argc == 1) return relation.remove(sqlite3_value_int64(argv[0]));
  const Values values(argv + 2, static_cast<std::size_t>(argc) - 2);
  const bool replaces = sqlite3_vtab_on_conflict(link.connection) == SQLITE_REPLACE;
  if (sqlite3_value_type(argv[0]) == SQLITE_NULL) {
    check_id_is_left_out(argv[1]);
    *id_out = relation.insert(values, replaces);
    return;
  }
  const sqlite3_int64 id = sqlite3_value_int64(argv[0]);
  if (sqlite3_value_int64(argv[1]) != id) check_id_is_left_out(argv[1]);
  relation.update(id, values, replaces);
}

int update(sqlite3_vtab* table, int argc, sqlite3_value** argv, sqlite3_int64* id_out) {
  return locked(table, [&](Link& link, Lock& lock) {
    link.begin_writing(lock);
    try {
      change(link, argc, argv, id_out);
    } catch (const std::bad_alloc&) {
      link.file->journal().set_broken();  // a change may have been made that does not stand in it
      throw;
    }
  });
}

int begin(sqlite3_vtab* table) {
  return locked(table, [](Link& link, Lock& lock) {
    link.marks.clear();
    link.begin_writing(lock);
  });
}

int sync(sqlite3_vtab* table) {
  return locked(table, [](Link& link, Lock&) {
    if (link.writes) link.file->save();
  });
}

int commit(sqlite3_vtab* table) {
  return locked(table, [](Link& link, Lock&) {
    if (link.end()) link.file->commit();
  });
}

int rollback(sqlite3_vtab* table) {
  return locked(table, [](Link& link, Lock&) {
    if (link.end()) link.file->rollback();
  });
}

int savepoint(sqlite3_vtab* table, int number) {
  return locked(table, [=](Link& link, Lock&) {
    const std::size_t changes = link.file->changes_of(link.connection);
    link.marks.resize(static_cast<std::size_t>(number) + 1, changes);
    link.marks.back() = changes;
  });
}

int release(sqlite3_vtab*, int) { return SQLITE_OK; }

int rollback_to(sqlite3_vtab* table, int number) {
  return locked(table, [=](Link& link, Lock&) {
    const auto place = static_cast<std::size_t>(number);
    if (link.writes && place < link.marks.size()) link.file->journal().undo_to(link.marks[place]);
  });
}

constexpr sqlite3_module make_module() {
  sqlite3_module m{};
  m.iVersion = 2;
  m.xCreate = create;
  m.xConnect = connect;
  m.xBestIndex = best_index;
  m.xDisconnect = disconnect;
  m.xDestroy = destroy;
  m.xOpen = open_cursor;
  m.xClose = close_cursor;
  m.xFilter = filter;
  m.xNext = next;
  m.xEof = at_end;
  m.xColumn = column;
  m.xRowid = row_id;
  m.xUpdate = update;
  m.xBegin = begin;
  m.xSync = sync;
  m.xCommit = commit;
  m.xRollback = rollback;
  m.xSavepoint = savepoint;
  m.xRelease = release;
  m.xRollbackTo = rollback_to;
  return m;
}

constexpr sqlite3_module kModule = make_module();

void release_files(void* files) { delete static_cast<std::shared_ptr<Files>*>(files); }

}  // namespace

int add_modules(sqlite3* connection, const std::shared_ptr<Files>& files) {
  const auto add = [&](const char* name, const sqlite3_module* module) {
    return sqlite3_create_module_v2(connection, name, module, new std::shared_ptr<Files>(files),
                                    release_files);
  };
  int result = add("tevpf", &kModule);
  if (result == SQLITE_OK) result = add("tevpf_elements", elements_module());
  if (result == SQLITE_OK) result = add("tevpf_columns", columns_module());
  return result;
}

}  // namespace sql
