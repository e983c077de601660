#include "database.h"

#include <map>
#include <new>
#include <utility>

#include "module.h"
#include "names.h"
#include "refusal.h"
#include "values.h"

namespace sql {

struct Database::State {
  struct Attached {
    tevpf::File* file;
    std::shared_ptr<SharedFile> shared;
  };

  struct Attaching {
    explicit Attaching(bool& state) : is_attaching(state) { is_attaching = true; }
    ~Attaching() { is_attaching = false; }
    Attaching(const Attaching&) = delete;
    Attaching& operator=(const Attaching&) = delete;
    bool& is_attaching;
  };

  sqlite3* connection = nullptr;
  std::map<std::string, Attached> files;  // by schema
  std::string denied;                     // why the last statement was not prepared
  bool is_attaching = false;

  void check(int result) const {
    if (result == SQLITE_NOMEM) throw std::bad_alloc();
    if (result != SQLITE_OK) throw Error(sqlite3_errmsg(connection));
  }
  void run(const std::string& text) const {
    check(sqlite3_exec(connection, text.c_str(), nullptr, nullptr, nullptr));
  }
  void link(const NamedElement& named, const std::string& schema) const;
  static int authorize(void* object, int action, const char* first, const char* second,
                       const char* schema, const char* trigger);
  bool is_of_file(const char* schema) const {
    return schema != nullptr && files.find(schema) != files.end();
  }
};

// ---- Attaching ----------------------------------------------------------------------------------

namespace {

std::string literal(std::string_view text) {
  std::string result = "'";
  for (const char c : text) {
    if (c == '\'') result += c;
    result += c;
  }
  return result + "'";
}

}  // namespace

// One that SQLite cannot hold (it has more columns than SQLite allows) is left out.
void Database::State::link(const NamedElement& named, const std::string& schema) const {
  const std::string text = "CREATE VIRTUAL TABLE " + identifier(schema) + "." +
                           identifier(named.name) + " USING tevpf(" + literal(schema) + ", " +
                           literal(named.element.name) + ", " +
                           (named.element.kind == tevpf::Kind::table ? "'table')" : "'list')");
  const int result = sqlite3_exec(connection, text.c_str(), nullptr, nullptr, nullptr);
  if (result == SQLITE_NOMEM) throw std::bad_alloc();
}

// SQLite's authorizer. Tables of SQL that are made or dropped among those of a file would look as if they
// changed it.
int Database::State::authorize(void* object, int action, const char* first, const char*,
                               const char* schema, const char*) {
  State& state = *static_cast<State*>(object);
  if (state.is_attaching) return SQLITE_OK;
  switch (action) {
    case SQLITE_CREATE_TABLE:
    case SQLITE_CREATE_VTABLE:
    case SQLITE_CREATE_INDEX:
    case SQLITE_CREATE_VIEW:
    case SQLITE_CREATE_TRIGGER:
      if (!state.is_of_file(schema)) return SQLITE_OK;
      state.denied =
          "lists, tables and columns of a file are not made by SQL; CREATE TEMP TABLE and "
          "CREATE TEMP VIEW make ones that last until the end";
      return SQLITE_DENY;
    case SQLITE_DROP_TABLE:
    case SQLITE_DROP_VTABLE:
    case SQLITE_ALTER_TABLE:
    case SQLITE_DETACH: {
      const bool is_first = action == SQLITE_ALTER_TABLE || action == SQLITE_DETACH;
      if (!state.is_of_file(is_first ? first : schema)) return SQLITE_OK;
      state.denied = "lists and tables of a file are not removed or renamed by SQL";
      return SQLITE_DENY;
    }
    default:
      return SQLITE_OK;
  }
}

Database::Database() : state_(std::make_unique<State>()) {
  State& state = *state_;
  const int result = sqlite3_open(":memory:", &state.connection);
  if (result != SQLITE_OK) {
    sqlite3_close(state.connection);
    throw std::bad_alloc();
  }
  const auto files = std::make_shared<Files>();
  files->usual = "main";
  files->find = [&state](const std::string& schema) {
    const auto found = state.files.find(schema);
    if (found != state.files.end()) return found->second.shared;
    throw Refusal(SQLITE_ERROR, "no file is attached as '" + schema + "'");
  };
  state.check(add_modules(state.connection, files));
  sqlite3_set_authorizer(state.connection, State::authorize, &state);
}

Database::~Database() { sqlite3_close_v2(state_->connection); }

void Database::attach(tevpf::File& file, const std::string& schema) {
  State& state = *state_;
  const State::Attaching attaching(state.is_attaching);
  if (schema != "main") state.run("ATTACH ':memory:' AS " + identifier(schema));
  state.files[schema] = {&file, std::make_shared<SharedFile>(file)};
  state.run("BEGIN");
  for (const NamedElement& named : named_elements(file)) state.link(named, schema);
  state.run("COMMIT");
}

// ---- Statements ---------------------------------------------------------------------------------

Statement Database::prepare(std::string_view& sql) {
  State& state = *state_;
  sqlite3_stmt* statement = nullptr;
  const char* tail = nullptr;
  state.denied.clear();
  if (sql.find('\0') != std::string_view::npos) throw Error("there is a zero byte in the text");
  if (!std::in_range<int>(sql.size())) throw Error("the text is too long");
  const int result = sqlite3_prepare_v2(state.connection, sql.data(), static_cast<int>(sql.size()),
                                        &statement, &tail);
  if (!state.denied.empty()) throw Error(state.denied);
  state.check(result);
  sql.remove_prefix(static_cast<std::size_t>(tail - sql.data()));
  return Statement(statement);
}

Statement Database::prepare_one(std::string_view sql) {
  std::string_view rest = sql;
  Statement statement = prepare(rest);
  while (!rest.empty()) {
    if (prepare(rest).statement_ != nullptr) throw Error("there is more than one statement");
  }
  return statement;
}

bool Database::is_changed(const std::string& schema) const {
  return state_->files.at(schema).shared->was_changed();
}

bool Database::is_in_transaction() const { return sqlite3_get_autocommit(state_->connection) == 0; }

std::int64_t Database::changed_rows() const { return sqlite3_changes64(state_->connection); }

std::string Database::table(const tevpf::Element& element, const std::string& schema) const {
  for (const NamedElement& named : named_elements(*state_->files.at(schema).file)) {
    if (named.element.kind == element.kind && named.element.name == element.name) {
      return identifier(schema) + "." + identifier(named.name);
    }
  }
  throw Error("there is no '" + element.name + "'");
}

void Statement::Finalize::operator()(sqlite3_stmt* statement) const { sqlite3_finalize(statement); }

namespace {

void check(sqlite3_stmt* statement, int result) {
  if (result == SQLITE_NOMEM) throw std::bad_alloc();
  if (result != SQLITE_OK) throw Error(sqlite3_errmsg(sqlite3_db_handle(statement)));
}

}  // namespace

void Statement::bind(int parameter, std::int64_t number) {
  check(statement_.get(), sqlite3_bind_int64(statement_.get(), parameter, number));
}

void Statement::bind(int parameter, double number) {
  check(statement_.get(), sqlite3_bind_double(statement_.get(), parameter, number));
}

void Statement::bind(int parameter, std::string_view text) {
  check(statement_.get(), sqlite3_bind_text64(statement_.get(), parameter, text.data(), text.size(),
                                              SQLITE_TRANSIENT, SQLITE_UTF8));
}

bool Statement::step() {
  if (statement_ == nullptr) return false;
  const int result = sqlite3_step(statement_.get());
  if (result == SQLITE_ROW) return true;
  check(statement_.get(), result == SQLITE_DONE ? SQLITE_OK : result);
  return false;
}

void Statement::reset() { sqlite3_reset(statement_.get()); }

int Statement::columns() const { return sqlite3_column_count(statement_.get()); }

std::string Statement::name(int column) const {
  const char* const name = sqlite3_column_name(statement_.get(), column);
  if (name == nullptr) throw std::bad_alloc();
  return name;
}

Statement::Type Statement::type(int column) const {
  switch (sqlite3_column_type(statement_.get(), column)) {
    case SQLITE_INTEGER:
      return Type::integer;
    case SQLITE_FLOAT:
      return Type::real;
    case SQLITE_TEXT:
      return Type::text;
    case SQLITE_BLOB:
      return Type::blob;
    default:
      return Type::null;
  }
}

std::int64_t Statement::integer(int column) const {
  return sqlite3_column_int64(statement_.get(), column);
}

double Statement::real(int column) const { return sqlite3_column_double(statement_.get(), column); }

std::string Statement::text(int column) const {
  const auto* const bytes = static_cast<const char*>(
      type(column) == Type::blob
          ? sqlite3_column_blob(statement_.get(), column)
          : reinterpret_cast<const char*>(sqlite3_column_text(statement_.get(), column)));
  if (bytes == nullptr) return {};
  return {bytes, static_cast<std::size_t>(sqlite3_column_bytes(statement_.get(), column))};
}

namespace {

std::string_view declared_type(sqlite3_stmt* statement, int column) {
  const char* const type = sqlite3_column_decltype(statement, column);
  return type == nullptr ? std::string_view() : std::string_view(type);
}

}  // namespace

bool Statement::is_single(int column) const {
  return declared_type(statement_.get(), column) == "REAL";
}

bool Statement::is_number(int column) const {
  const std::string_view type = declared_type(statement_.get(), column);
  return type == "INTEGER" || type == "SMALLINT" || type == "REAL" || type == "DOUBLE";
}

}  // namespace sql
