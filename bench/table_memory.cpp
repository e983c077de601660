// The memory that a table takes after its rows were appended at random, ours and SQLite's.
#include "fresh_process.h"
#include "parts_table.h"

namespace {

using namespace bench;

Measured memory_ours(std::int64_t n) {
  const std::vector<std::int32_t> ids = shuffled(n);
  const OpenFile file;
  define_table();
  const double before = resident_bytes();
  const Timer timer;
  for (const std::int32_t id : ids) {
    const Row r = row(id);
    MUST(TEV8R1_PF_add_row("parts", &r));
  }
  return {timer.seconds(), static_cast<double>(n), resident_bytes() - before};
}

Measured memory_sqlite(std::int64_t n) {
  const std::vector<std::int32_t> ids = shuffled(n);
  Database db;
  fill_sqlite(db, {});
  const double before = resident_bytes();
  const Timer timer;
  db.run("BEGIN");
  Statement into(db, kInsert);
  for (const std::int32_t id : ids) insert(into, row(id));
  db.run("COMMIT");
  return {timer.seconds(), static_cast<double>(n), resident_bytes() - before};
}

const int registered = [] {
  add_fresh("table memory", "tevpf", memory_ours, {1'000'000});
  add_fresh("table memory", "sqlite", memory_sqlite, {1'000'000});
  return 0;
}();

}  // namespace
