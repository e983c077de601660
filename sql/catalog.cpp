#include "catalog.h"

#include <memory>
#include <optional>
#include <string>
#include <variant>
#include <vector>

#include "files.h"
#include "guard.h"
#include "names.h"
#include "values.h"

namespace sql {
namespace {

using Cell = std::variant<std::monostate, std::int64_t, tevpf::Value>;
using Row = std::vector<Cell>;

struct Catalog : sqlite3_vtab {
  Catalog() : sqlite3_vtab{} {}
  Connection connection = nullptr;
  std::shared_ptr<Files> files;
};

struct CatalogCursor : sqlite3_vtab_cursor {
  CatalogCursor() : sqlite3_vtab_cursor{} {}
  std::string file;
  std::vector<Row> rows;
  std::size_t next = 0;
};

CatalogCursor& cursor_of(sqlite3_vtab_cursor* cursor) {
  return *static_cast<CatalogCursor*>(cursor);
}

const char* word_of(tevpf::Kind kind) { return kind == tevpf::Kind::table ? "table" : "list"; }

// ---- Their rows ---------------------------------------------------------------------------------

std::vector<Row> element_rows(const tevpf::File& file) {
  std::vector<Row> rows;
  for (const NamedElement& named : named_elements(file)) {
    const tevpf::Element& e = named.element;
    const std::size_t size =
        e.kind == tevpf::Kind::table ? file.table(e.name).size() : file.list(e.name).size();
    rows.push_back(
        {named.name, word_of(e.kind), e.name, static_cast<std::int64_t>(size), e.description});
  }
  return rows;
}

Row column_row(const std::string& table, const std::string& name, const tevpf::Column& column) {
  const auto& bounds = column.bounds();
  const auto flag = [](bool is_set) { return std::int64_t{is_set ? 1 : 0}; };
  return {table,
          name,
          tevpf::to_string(column.type()),
          column.units(),
          bounds ? Cell(bounds->min) : Cell(),
          bounds ? Cell(bounds->max) : Cell(),
          column.precision() > 0 ? Cell(std::int64_t{column.precision()}) : Cell(),
          std::int64_t{column.width()},
          flag(column.is_indexed()),
          flag(column.is_unique()),
          column.description()};
}

std::vector<Row> column_rows(const tevpf::File& file) {
  std::vector<Row> rows;
  for (const NamedElement& named : named_elements(file)) {
    if (named.element.kind != tevpf::Kind::table) continue;
    const std::vector<tevpf::Column> columns = file.table(named.element.name).columns();
    const std::vector<std::string> names = column_names(columns);
    for (std::size_t i = 0; i < columns.size(); ++i) {
      rows.push_back(column_row(named.name, names[i], columns[i]));
    }
  }
  return rows;
}

struct Elements {
  static constexpr const char* declaration =
      "CREATE TABLE elements(name TEXT, kind TEXT, element TEXT, rows INTEGER, description TEXT, "
      "file HIDDEN)";
  static std::vector<Row> rows(const tevpf::File& file) { return element_rows(file); }
};

struct Columns {
  static constexpr const char* declaration =
      "CREATE TABLE columns(table_name TEXT, name TEXT, type TEXT, units TEXT, minimum, maximum, "
      "precision INTEGER, width INTEGER, indexed INTEGER, unique_values INTEGER, "
      "description TEXT, file HIDDEN)";
  static std::vector<Row> rows(const tevpf::File& file) { return column_rows(file); }
};

// ---- Their modules ------------------------------------------------------------------------------

template <class Content>
int connect(sqlite3* connection, void* files, int, const char* const*, sqlite3_vtab** table_out,
            char** message) {
  return guarded(message, [&] {
    auto catalog = std::make_unique<Catalog>();
    catalog->connection = connection;
    catalog->files = *static_cast<std::shared_ptr<Files>*>(files);
    if (sqlite3_declare_vtab(connection, Content::declaration) != SQLITE_OK) {
      throw Refusal(SQLITE_ERROR, sqlite3_errmsg(connection));
    }
    *table_out = catalog.release();
  });
}

int disconnect(sqlite3_vtab* table) {
  const Lock lock(library_mutex());
  delete static_cast<Catalog*>(table);
  return SQLITE_OK;
}

// The last column is the argument.
template <int kFile>
int best_index(sqlite3_vtab*, sqlite3_index_info* info) {
  info->estimatedCost = 1e6;
  for (int i = 0; i < info->nConstraint; ++i) {
    const auto& constraint = info->aConstraint[i];
    if (constraint.iColumn != kFile || constraint.op != SQLITE_INDEX_CONSTRAINT_EQ) continue;
    if (constraint.usable == 0) return SQLITE_CONSTRAINT;
    info->aConstraintUsage[i].argvIndex = 1;
    info->aConstraintUsage[i].omit = 1;
    info->estimatedCost = 100;
    break;
  }
  return SQLITE_OK;
}

int open_cursor(sqlite3_vtab* table, sqlite3_vtab_cursor** cursor_out) {
  return guarded(&table->zErrMsg, [&] { *cursor_out = new CatalogCursor; });
}

int close_cursor(sqlite3_vtab_cursor* cursor) {
  delete &cursor_of(cursor);
  return SQLITE_OK;
}

template <class Content>
int filter(sqlite3_vtab_cursor* cursor, int, const char*, int argc, sqlite3_value** argv) {
  return guarded(&cursor->pVtab->zErrMsg, [&] {
    const Catalog& catalog = *static_cast<Catalog*>(cursor->pVtab);
    CatalogCursor& read = cursor_of(cursor);
    read.file = argc > 0 ? std::string(text_of(argv[0])) : catalog.files->usual;
    read.next = 0;
    if (read.file.empty()) {
      throw Refusal(SQLITE_ERROR, "name the file, as in tevpf_elements('lab.pf')");
    }
    Lock lock(library_mutex());
    const std::shared_ptr<SharedFile> file = catalog.files->find(read.file);
    file->begin_reading(catalog.connection, lock);
    struct Reading {
      SharedFile& file;
      Connection connection;
      ~Reading() { file.end_reading(connection); }
    } const reading{*file, catalog.connection};
    read.rows = Content::rows(file->file());
  });
}

int next(sqlite3_vtab_cursor* cursor) {
  ++cursor_of(cursor).next;
  return SQLITE_OK;
}

int at_end(sqlite3_vtab_cursor* cursor) {
  return cursor_of(cursor).next >= cursor_of(cursor).rows.size() ? 1 : 0;
}

int column(sqlite3_vtab_cursor* cursor, sqlite3_context* context, int column) {
  const CatalogCursor& read = cursor_of(cursor);
  const Row& row = read.rows[read.next];
  if (static_cast<std::size_t>(column) >= row.size()) {
    deliver(context, std::string_view(read.file));
    return SQLITE_OK;
  }
  const Cell& cell = row[static_cast<std::size_t>(column)];
  if (const auto* const number = std::get_if<std::int64_t>(&cell)) {
    sqlite3_result_int64(context, *number);
  } else if (const auto* const value = std::get_if<tevpf::Value>(&cell)) {
    deliver(context, *value);
  }
  return SQLITE_OK;
}

int row_id(sqlite3_vtab_cursor* cursor, sqlite3_int64* id_out) {
  *id_out = static_cast<sqlite3_int64>(cursor_of(cursor).next) + 1;
  return SQLITE_OK;
}

// Without xCreate a module is a table of its own name.
template <class Content, int kFile>
constexpr sqlite3_module make_module() {
  sqlite3_module m{};
  m.xConnect = connect<Content>;
  m.xBestIndex = best_index<kFile>;
  m.xDisconnect = disconnect;
  m.xOpen = open_cursor;
  m.xClose = close_cursor;
  m.xFilter = filter<Content>;
  m.xNext = next;
  m.xEof = at_end;
  m.xColumn = column;
  m.xRowid = row_id;
  return m;
}

constexpr sqlite3_module kElements = make_module<Elements, 5>();
constexpr sqlite3_module kColumns = make_module<Columns, 11>();

}  // namespace

const sqlite3_module* elements_module() { return &kElements; }
const sqlite3_module* columns_module() { return &kColumns; }

}  // namespace sql
