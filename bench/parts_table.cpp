#include "parts_table.h"

#include <cstring>

namespace bench {

namespace {

TEVPF_COL_DEF column(std::int32_t type, const char* name, int width, bool index = false,
                     bool unique = false) {
  TEVPF_COL_DEF def{};
  def.type = type;
  std::strcpy(def.name, name);
  def.width = width;
  def.idx_flag = index;
  def.unq_flag = unique;
  if (type == PF_TYPE_INT) def.limits.i32 = {2147483647, -2147483647};
  if (type == PF_TYPE_DOUBLE) def.limits.f64 = {1e12, -1e12, 6};
  if (type == PF_TYPE_SHORT) def.limits.i16 = {32767, -32767};
  return def;
}

void set_indexes(bool on) {
  MUST(TEV8R1_PF_modify_col_def("parts", "id", column(PF_TYPE_INT, "id", 8, on, on)));
  MUST(TEV8R1_PF_modify_col_def("parts", "group", column(PF_TYPE_INT, "group", 11, on)));
}

}  // namespace

Row row(std::int32_t id, std::int32_t groups) {
  const std::uint32_t random = scrambled(static_cast<std::uint32_t>(id));
  const std::uint32_t more = scrambled(~random), still_more = scrambled(~more);
  Row r{};
  r.id = id;
  std::snprintf(r.name, sizeof r.name, "part %08x", random);
  r.measure = 1e6 * (more + 0x1p-32 * still_more) * 0x1p-32;
  r.kind = static_cast<std::int16_t>(id % 1000);
  r.group = static_cast<std::int32_t>(still_more % static_cast<std::uint32_t>(groups));
  return r;
}

std::vector<Row> rows_of(std::int64_t n, std::int32_t groups, std::int32_t gap) {
  std::vector<Row> all;
  all.reserve(static_cast<std::size_t>(n));
  for (std::int32_t i = 0; i < n; ++i) all.push_back(row(i * gap, groups));
  return all;
}

std::vector<Row> shuffled_rows(std::int64_t n, std::int32_t gap) {
  std::vector<Row> all = rows_of(n, kSpread, gap);
  std::shuffle(all.begin(), all.end(), std::mt19937(kSeed));
  return all;
}

NewIds::NewIds(std::int64_t n) : used_(static_cast<std::size_t>(n)) {}

std::int32_t NewIds::next() {
  std::uniform_int_distribution<std::size_t> any(0, used_.size() - 1);
  std::size_t at = any(random_);
  while (used_[at] == kGap - 1) at = any(random_);
  return static_cast<std::int32_t>(at) * kGap + ++used_[at];
}

void define_table() {
  MUST(TEV8R1_PF_create_elem("parts", "", PF_ELEM_TABLE));
  MUST(TEV8R1_PF_def_column("parts", column(PF_TYPE_INT, "id", 8, true, true)));
  MUST(TEV8R1_PF_def_column("parts", column(PF_TYPE_STRING, "name", 20)));
  MUST(TEV8R1_PF_def_column("parts", column(PF_TYPE_DOUBLE, "measure", 12)));
  MUST(TEV8R1_PF_def_column("parts", column(PF_TYPE_SHORT, "class", 6)));
  MUST(TEV8R1_PF_def_column("parts", column(PF_TYPE_INT, "group", 11, true)));
  std::int32_t count, *offsets;
  MUST(TEV8R1_PF_inq_col_offsets("parts", &count, &offsets));
  if (offsets[2] != offsetof(Row, measure) || offsets[4] != offsetof(Row, group))
    give_up("layout", offsets[4]);
  std::free(offsets);
}

void fill_table(std::span<const Row> all) {
  define_table();
  set_indexes(false);
  MUST(TEV8R1_set_interactive_table("parts"));
  for (const Row& r : all) MUST(TEV8R1_PF_add_row("parts", &r));
  MUST(TEV8R1_turn_off_interactive());
  set_indexes(true);
}

std::string saved_table(std::span<const Row> all) {
  const std::string path = folder().file("table.pf");
  const OpenFile file;
  fill_table(all);
  MUST(TEV8R1_PF_save(path.c_str()));
  return path;
}

void insert(Statement& into, const Row& r) {
  into.integer(1, r.id)
      .text(2, r.name)
      .real(3, r.measure)
      .integer(4, r.kind)
      .integer(5, r.group)
      .once();
}

void fill_sqlite(Database& db, std::span<const Row> all) {
  db.run(
      "CREATE TABLE parts(id INTEGER PRIMARY KEY, name TEXT, measure REAL, class INTEGER, grp "
      "INTEGER)");
  db.run("CREATE INDEX by_group ON parts(grp)");
  db.run("BEGIN");
  Statement into(db, kInsert);
  for (const Row& r : all) insert(into, r);
  db.run("COMMIT");
}

void read_row(const Statement& from, Row& r) {
  r.id = sqlite3_column_int(from.get(), 0);
  std::strcpy(r.name, reinterpret_cast<const char*>(sqlite3_column_text(from.get(), 1)));
  r.measure = sqlite3_column_double(from.get(), 2);
  r.kind = static_cast<std::int16_t>(sqlite3_column_int(from.get(), 3));
  r.group = sqlite3_column_int(from.get(), 4);
}

void find_id(Statement& find, std::int32_t id, Row& r) {
  if (!find.integer(1, id).step()) give_up("find", id);
  read_row(find, r);
  benchmark::DoNotOptimize(r);
  find.reset();
}

void read_all_sqlite(const Database& db, const char* sql) {
  Statement all(db, sql);
  Row r;
  while (all.step()) {
    read_row(all, r);
    benchmark::DoNotOptimize(r);
  }
}

}  // namespace bench
