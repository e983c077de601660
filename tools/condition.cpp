#include "condition.h"

#include <cstdint>

#include "failure.h"
#include "sql/database.h"
#include "text.h"

namespace tool {
namespace {

[[noreturn]] void refuse(const tevpf::File& file, const std::string& expression,
                         const sql::Error& error) {
  throw Failure(kRefused,
                visible(file.name()) + ": " + in_quotes(expression) + ": " + visible(error.what()));
}

}  // namespace

std::vector<std::size_t> rows_where(tevpf::File& file, const tevpf::Element& table,
                                    const std::string& condition) {
  try {
    sql::Database database;
    database.attach(file);
    sql::Statement found = database.prepare_one("select rowid from " + database.table(table) +
                                                " where (" + condition + "\n) order by rowid");
    std::vector<std::size_t> rows;
    while (found.step()) rows.push_back(static_cast<std::size_t>(found.integer(0)) - 1);
    return rows;
  } catch (const sql::Error& error) {
    refuse(file, condition, error);
  }
}

void update_rows(tevpf::File& file, const tevpf::Element& table,
                 const std::vector<std::size_t>& rows, const std::string& changes) {
  try {
    sql::Database database;
    database.attach(file);
    // A temporary table of the numbers: the condition has been decided, and any number of rows fits.
    database.prepare_one("create temp table chosen_rows (row integer primary key)").step();
    sql::Statement choose = database.prepare_one("insert into chosen_rows values (?)");
    for (const std::size_t row : rows) {
      choose.bind(1, static_cast<std::int64_t>(row) + 1);
      choose.step();
      choose.reset();
    }
    database
        .prepare_one("update " + database.table(table) + " set " + changes +
                     "\nwhere rowid in (select row from temp.chosen_rows)")
        .step();
  } catch (const sql::Error& error) {
    refuse(file, changes, sql::Error(std::string(error.what()) + "; nothing was changed"));
  }
}

}  // namespace tool
