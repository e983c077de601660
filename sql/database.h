// SQL over open parameter files, for programs: statements with parameters, their rows, and what was
// refused. Each list and table is a table of SQL; see names.h for its name there.
//
//   sql::Database database;
//   database.attach(file, "main");
//   auto statement = database.prepare("select symbol from elements where melting > ?");
//   statement.bind(1, 1000.0);
//   while (statement.step()) std::cout << statement.text(0) << '\n';
//   if (database.is_changed("main")) file.save();
//
// A table's rowids count its rows from 1, and stay as they are until a transaction ends.
#pragma once

#include <cstdint>
#include <memory>
#include <stdexcept>
#include <string>
#include <string_view>

#include "tevpf.hpp"

struct sqlite3;
struct sqlite3_stmt;

namespace sql {

// A statement that cannot be run, or was refused: it has changed nothing.
class Error : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

class Statement {
 public:
  enum class Type { null, integer, real, text, blob };

  // Parameters count from 1. Texts are copied.
  void bind(int parameter, std::int64_t number);
  void bind(int parameter, double number);  // NULL when it is not a number
  void bind(int parameter, std::string_view text);

  // Goes on to the next row; false behind the last one, when all is done. Throws Error.
  bool step();
  void reset();  // to be run again; parameters stay

  // Columns count from 0.
  int columns() const;
  std::string name(int column) const;
  Type type(int column) const;  // of the current row's value
  std::int64_t integer(int column) const;
  double real(int column) const;
  std::string text(int column) const;  // any value; bytes as they are
  bool is_single(int column) const;    // reals here come from a column of single precision
  bool is_number(int column) const;    // the column is declared as one of numbers

 private:
  friend class Database;
  struct Finalize {
    void operator()(sqlite3_stmt* statement) const;
  };
  explicit Statement(sqlite3_stmt* statement) : statement_(statement) {}
  std::unique_ptr<sqlite3_stmt, Finalize> statement_;
};

class Database {
 public:
  Database();
  ~Database();
  Database(const Database&) = delete;
  Database& operator=(const Database&) = delete;

  // Shows a file under the name of a schema, "main" for one of them. The file stays the caller's: open
  // longer than this object, and not changed in other ways while statements run. Damaged and read-only
  // files are shown, but not changed. Throws Error: there is a schema of this name.
  void attach(tevpf::File& file, const std::string& schema = "main");

  // A statement of its own; the part of `sql` that it takes up is removed. None (columns() is 0 and
  // step() false at once) for blanks and comments. Throws Error.
  Statement prepare(std::string_view& sql);
  // All of the text is one statement.
  Statement prepare_one(std::string_view sql);

  // Whether statements have changed a file; in a transaction that is still open only after its end.
  bool is_changed(const std::string& schema = "main") const;
  bool is_in_transaction() const;
  std::int64_t changed_rows() const;  // by the last INSERT, UPDATE or DELETE

  // The name of an element in SQL, in quotes and with its schema: ready for a statement.
  std::string table(const tevpf::Element& element, const std::string& schema = "main") const;

 private:
  struct State;
  std::unique_ptr<State> state_;
};

}  // namespace sql
