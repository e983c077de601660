// The same statements on a table of a parameter file and on one of SQLite's own.
#include "support/temp_file.h"  // first: its names in the library's own namespace are not ours

#include <gtest/gtest.h>

#include <random>
#include <string>
#include <tevpf.hpp>
#include <vector>

#include "sql/database.h"

namespace {

using tevpf::Column;
using tevpf::File;
using tevpf::Type;

class SqlModelTest : public LibraryTest, public testing::WithParamInterface<unsigned> {
 protected:
  SqlModelTest() {
    auto table = file_.create_table("t");
    table.add_column(Column("id", Type::int32).unique().bounds(0, 60));
    table.add_column(Column("grade", Type::int16).indexed());
    // Its values differ by less than its tolerance of 0.0001, so that its index is not in SQL's order.
    table.add_column(Column("mass", Type::float64).precision(3).indexed());
    table.add_column(Column("heat", Type::float32).bounds(-10, 10));
    table.add_column(Column("symbol", Type::string).width(5).indexed());
    table.add_column(Column("Symbol", Type::string).width(5));
    database_.attach(file_);
    run("CREATE TEMP TABLE plain(id INTEGER NOT NULL UNIQUE CHECK(id BETWEEN 0 AND 60), grade "
        "INTEGER "
        "NOT NULL, mass REAL, heat REAL CHECK(heat BETWEEN -10 AND 10), symbol TEXT, \"2:Symbol\" "
        "TEXT "
        "DEFAULT '')");
  }

  // All rows as one text; "refused" instead of the words of a refusal.
  std::string run(const std::string& text) {
    std::string result;
    try {
      auto statement = database_.prepare_one(text);
      while (statement.step()) {
        for (int c = 0; c < statement.columns(); ++c) {
          const bool is_null = statement.type(c) == sql::Statement::Type::null;
          result += (is_null ? "NULL" : statement.text(c)) + '|';
        }
        result += '\n';
      }
      return result;
    } catch (const sql::Error&) {
      return "refused";
    }
  }

  // Runs a statement with the names of both tables in place of "@".
  void run_both(const std::string& pattern) {
    const auto named = [&](const char* table) {
      std::string text = pattern;
      for (std::size_t at; (at = text.find('@')) != std::string::npos;) text.replace(at, 1, table);
      return text;
    };
    ASSERT_EQ(run(named("main.t")), run(named("temp.plain"))) << pattern;
  }

  int pick(int end) { return static_cast<int>(random_() % static_cast<unsigned>(end)); }
  std::string one_of(const std::vector<std::string>& texts) {
    return texts[static_cast<std::size_t>(pick(static_cast<int>(texts.size())))];
  }
  std::string mass() {
    if (pick(8) == 0) return "NULL";
    return std::to_string(pick(12)) + ".0000" + std::to_string(pick(10));
  }
  std::string symbol() {
    return one_of({"'Fe'", "'Fe2'", "'fe'", "'F*'", "'Hg'", "''", "'\xC3\xA9t'", "'O[2'", "12"});
  }
  std::string value_of(const std::string& column) {
    if (column == "id") return pick(30) == 0 ? "NULL" : std::to_string(pick(64) - 1);
    if (column == "grade") return one_of({"1", "2.0", "'3'", "-7", "4", "2"});
    if (column == "mass") return mass();
    if (column == "heat") return one_of({"NULL", "0.25", "-9.5", "3", "10.5"});
    return symbol();
  }
  std::string column() { return one_of({"id", "grade", "mass", "heat", "symbol", "\"2:Symbol\""}); }

  std::string condition() {
    const std::string name = column();
    const std::string operation = one_of({"=", "<", "<=", ">", ">=", "IS", "<>"});
    switch (pick(8)) {
      case 0:
        return "symbol GLOB " +
               one_of({"'F*'", "'Fe*'", "'*e'", "'?e2'", "'[F-H]*'", "''", "NULL"});
      case 1:
        return name + " IS NULL";
      case 2:
        return "mass >= " + mass() + " AND mass < " + mass();
      case 3:
        return "id IN (3, " + value_of("id") + ", 17)";
      case 4:  // compared as numbers, or with another collation: no business of the index
        return one_of({"symbol = 12.0", "symbol = 'FE' COLLATE NOCASE", "id < 'x'", "mass > 'x'",
                       "symbol > 3", "grade > 1.5 AND grade < 2.5"});
      default:
        return name + " " + operation + " " + value_of(name);
    }
  }

  void change() {
    const std::string conflict = one_of({"", "", "", " OR REPLACE", " OR IGNORE", " OR FAIL"});
    switch (pick(6)) {
      case 0:
      case 1: {
        std::string values;
        for (const char* name : {"id", "grade", "mass", "heat", "symbol", "symbol"}) {
          values += (values.empty() ? "" : ", ") + value_of(name);
        }
        return run_both("INSERT" + conflict + " INTO @ VALUES(" + values + ")");
      }
      case 2:
        return run_both("INSERT" + conflict + " INTO @(id, grade, symbol, mass) SELECT id + " +
                        std::to_string(pick(9)) + ", id, '', mass FROM @ WHERE " + condition() +
                        " ORDER BY rowid");
      case 3: {
        const std::string name = column();
        return run_both("UPDATE @ SET " + name + " = " + value_of(name) + " WHERE " + condition());
      }
      case 4:
        return run_both("UPDATE @ SET id = id + 31, heat = heat * 2 WHERE id < 31 AND " +
                        condition());
      default:
        return run_both("DELETE FROM @ WHERE " + condition() +
                        " AND id % 3 = " + std::to_string(pick(3)));
    }
  }

  void transact() {
    if (!database_.is_in_transaction()) {
      run("BEGIN");
    } else {
      run(one_of(
          {"COMMIT", "ROLLBACK", "SAVEPOINT a", "SAVEPOINT a", "ROLLBACK TO a", "RELEASE a"}));
    }
  }

  void look() {
    run_both("SELECT * FROM (SELECT * FROM @ WHERE " + condition() + ") ORDER BY id");
    const std::string name = column();
    run_both("SELECT " + name + " FROM @ WHERE " + condition() + " ORDER BY " + name +
             one_of({"", " DESC", " DESC LIMIT 3", " LIMIT 2 OFFSET 1", " NULLS LAST"}));
    run_both("SELECT count(*) FROM @ a JOIN @ b ON a." + name + " = b." + name);
    run_both("SELECT * FROM @ ORDER BY rowid" + one_of({"", " DESC"}));
    if (!database_.is_in_transaction()) {
      ASSERT_EQ(run("SELECT coalesce(max(rowid), 0) FROM t"), run("SELECT count(*) FROM t"));
    }
    // Each row is found by its rowid, in a transaction as well.
    ASSERT_EQ(run("SELECT id FROM t ORDER BY rowid"),
              run("SELECT (SELECT id FROM t WHERE rowid = a.rowid) FROM t a ORDER BY rowid"));
  }

  File file_ = File::create(dir_ / "file.pf");
  std::mt19937 random_{GetParam()};
  sql::Database database_;
};

TEST_P(SqlModelTest, ARandomSequenceGivesTheSameAsInSqlite) {
  for (int step = 0; step < 400 && !HasFatalFailure(); ++step) {
    pick(12) == 0 ? transact() : change();
    if (!HasFatalFailure()) look();
  }
  if (HasFatalFailure()) return;
  if (database_.is_in_transaction()) run("ROLLBACK");
  file_.save();
  const File copy = [&] {
    std::filesystem::copy_file(file_.name(), dir_ / "copy.pf");
    return File::open(dir_ / "copy.pf");
  }();
  EXPECT_EQ(copy.table("t").size(), file_.table("t").size());
}

class SqlNamesTest : public LibraryTest {};

TEST_F(SqlNamesTest, EveryElementAndColumnIsReachedWhateverItsName) {
  File file = File::create(dir_ / "file.pf");
  const std::string names[] = {
      "pump",        "Pump",     "PUMP",    "sqlite_x", "list:pump", "select", "a\"b'\x01\xFF];--",
      "table2:pump", "\xC3\xA9", "\xC3\x89"};
  std::size_t rows = 0;
  for (const std::string& name : names) {
    tevpf::Table table = file.create_table(name);
    for (const std::string& column : names) table.add_column(Column(column, Type::int16));
    for (std::size_t i = ++rows; i > 0; --i) table.append(table.new_row());
    file.create_list(name).add(tevpf::Parameter(name, 1.5));
  }
  sql::Database database;
  database.attach(file);
  for (const tevpf::Element& element : file.elements()) {
    const bool is_table = element.kind == tevpf::Kind::table;
    auto statement = database.prepare_one("SELECT * FROM " + database.table(element));
    EXPECT_EQ(statement.columns(), is_table ? 10 : 8) << element.name;
    std::size_t count = 0;
    while (statement.step()) ++count;
    EXPECT_EQ(count, is_table ? file.table(element.name).size() : 1) << element.name;
  }
  auto columns = database.prepare_one(
      "SELECT count(DISTINCT table_name), count(DISTINCT lower(name)), count(*) FROM "
      "tevpf_columns");
  ASSERT_TRUE(columns.step());
  EXPECT_EQ(columns.text(0) + columns.text(1) + columns.text(2), "1010100");
}

INSTANTIATE_TEST_SUITE_P(Seeds, SqlModelTest,
                         testing::Range(TEVPF_FIRST_SEED, 9u, TEVPF_SEED_STEP));

}  // namespace
