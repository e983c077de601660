// Tables against SQLite and, where there is one, against a limit: the plain loop without a library.
//
// Columns: id (int32, indexed, unique), name (string[20]), measure (double), class (int16),
// group (int32, indexed).
#include <cstring>

#include "common.h"

namespace {

using namespace bench;

struct Row {  // as the library lays the columns out
  std::int32_t id;
  char name[21];
  char gap[7];
  double measure;
  std::int16_t kind;
  std::int16_t gap2;
  std::int32_t group;
};
static_assert(sizeof(Row) == 48);

Row row(std::int32_t id, std::int32_t groups) {
  Row r{};
  r.id = id;
  std::snprintf(r.name, sizeof r.name, "part %08x", static_cast<unsigned>(id) * 2654435761u);
  r.measure = id * 0.37 + 1.0 / 3;
  r.kind = static_cast<std::int16_t>(id % 1000);
  r.group = static_cast<std::int32_t>((static_cast<std::uint32_t>(id) * 2246822519u >> 4) %
                                      static_cast<std::uint32_t>(groups));
  return r;
}

constexpr std::int32_t kSpread = 1'000'000'000;  // group values that hardly ever meet
constexpr std::int32_t kFewGroups = 10;

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

std::vector<Row> rows_of(std::int64_t n, std::int32_t groups = kSpread) {
  std::vector<Row> all;
  for (std::int32_t i = 0; i < n; ++i) all.push_back(row(i, groups));
  return all;
}

// A table of these rows whose indexes are built at the end, which is the cheap way.
void fill_table(const std::vector<Row>& all) {
  define_table();
  TEVPF_COL_DEF group = column(PF_TYPE_INT, "group", 11);
  MUST(TEV8R1_PF_modify_col_def("parts", "group", group));
  MUST(TEV8R1_set_interactive_table("parts"));
  for (const Row& r : all) MUST(TEV8R1_PF_add_row("parts", &r));
  MUST(TEV8R1_turn_off_interactive());
  group.idx_flag = 1;
  MUST(TEV8R1_PF_modify_col_def("parts", "group", group));
}

void define_sqlite(Database& db) {
  db.run(
      "CREATE TABLE parts(id INTEGER PRIMARY KEY, name TEXT, measure REAL, class INTEGER, grp "
      "INTEGER)");
  db.run("CREATE INDEX by_group ON parts(grp)");
}

constexpr char kInsert[] = "INSERT INTO parts VALUES(?,?,?,?,?)";

void insert(Statement& into, const Row& r) {
  into.integer(1, r.id)
      .text(2, r.name)
      .real(3, r.measure)
      .integer(4, r.kind)
      .integer(5, r.group)
      .once();
}

void fill_sqlite(Database& db, const std::vector<Row>& all) {
  define_sqlite(db);
  db.run("BEGIN");
  Statement into(db, kInsert);
  for (const Row& r : all) insert(into, r);
  db.run("COMMIT");
}

enum class Order { kAscending, kRandom, kFewValues };

std::vector<Row> rows_to_append(std::int64_t n, Order order) {
  std::vector<Row> all = rows_of(n, order == Order::kFewValues ? kFewGroups : kSpread);
  if (order == Order::kRandom) std::shuffle(all.begin(), all.end(), std::mt19937(kSeed));
  if (order == Order::kAscending) {
    for (Row& r : all) r.group = r.id;
  }
  return all;
}

// Appending: all rows up to 100,000, beyond that the last thousand, unless order makes them cheap.
std::size_t already_there(std::int64_t n, Order order) {
  return n > kManyRows && order != Order::kAscending ? static_cast<std::size_t>(n - kFewOperations)
                                                     : 0;
}

template <Order order, bool interactive>
void append_ours(benchmark::State& state) {
  const std::vector<Row> all = rows_to_append(state.range(0), order);
  const auto start = static_cast<std::ptrdiff_t>(already_there(state.range(0), order));
  warm_memory();
  for (auto _ : state) {
    OpenFile file;
    if (start > 0) {
      fill_table({all.begin(), all.begin() + start});
    } else {
      define_table();
    }
    if (interactive) MUST(TEV8R1_set_interactive_table("parts"));
    const Timer timer;
    for (auto r = all.begin() + start; r != all.end(); ++r) MUST(TEV8R1_PF_add_row("parts", &*r));
    timer.stop(state, all.end() - (all.begin() + start));
    MUST(TEV8R1_turn_off_interactive());
  }
}

template <Order order>
void append_sqlite(benchmark::State& state) {
  const std::vector<Row> all = rows_to_append(state.range(0), order);
  const auto start = static_cast<std::ptrdiff_t>(already_there(state.range(0), order));
  warm_memory();
  for (auto _ : state) {
    Database db;
    fill_sqlite(db, {all.begin(), all.begin() + start});
    const Timer timer;
    db.run("BEGIN");
    Statement into(db, kInsert);
    for (auto r = all.begin() + start; r != all.end(); ++r) insert(into, *r);
    db.run("COMMIT");
    timer.stop(state, all.end() - (all.begin() + start));
  }
}

void read_ordered_ours(benchmark::State& state) {
  OpenFile file;
  fill_table(rows_of(state.range(0)));
  MUST(TEV8R1_PF_define_table_search("parts", "group"));
  Row r;
  for (auto _ : state) {
    MUST(TEV8R1_PF_reset_table("parts"));
    const Timer timer;
    while (TEV8R1_PF_get_next_row("parts", &r) == PF_NORMAL) benchmark::DoNotOptimize(r);
    timer.stop(state, state.range(0));
  }
}

void read_row(const Statement& from, Row& r) {
  r.id = sqlite3_column_int(from.get(), 0);
  std::strcpy(r.name, reinterpret_cast<const char*>(sqlite3_column_text(from.get(), 1)));
  r.measure = sqlite3_column_double(from.get(), 2);
  r.kind = static_cast<std::int16_t>(sqlite3_column_int(from.get(), 3));
  r.group = sqlite3_column_int(from.get(), 4);
}

void read_all_sqlite(const Database& db, const char* sql) {
  Statement all(db, sql);
  Row r;
  while (all.step()) {
    read_row(all, r);
    benchmark::DoNotOptimize(r);
  }
}

void read_ordered_sqlite(benchmark::State& state) {
  Database db;
  fill_sqlite(db, rows_of(state.range(0)));
  for (auto _ : state) {
    const Timer timer;
    read_all_sqlite(db, "SELECT * FROM parts ORDER BY grp");
    timer.stop(state, state.range(0));
  }
}

void read_ordered_limit(benchmark::State& state) {
  const std::vector<Row> all = rows_of(state.range(0));
  std::vector<std::int32_t> order = shuffled(state.range(0));
  Row r;
  for (auto _ : state) {
    const Timer timer;
    for (const std::int32_t i : order) {
      r = all[static_cast<std::size_t>(i)];
      benchmark::DoNotOptimize(r);
    }
    timer.stop(state, state.range(0));
  }
}

void find_ours(benchmark::State& state) {
  OpenFile file;
  fill_table(rows_of(state.range(0)));
  MUST(TEV8R1_PF_define_table_search("parts", "id"));
  const std::vector<std::int32_t> keys = some_of(state.range(0), kManyAccesses);
  Row r;
  for (auto _ : state) {
    const Timer timer;
    for (const std::int32_t key : keys) {
      TEV8R1_PF_reset_table("parts");
      MUST(TEV8R1_PF_get_row_by_value("parts", 0, "id", &key, &r));
    }
    timer.stop(state, std::ssize(keys));
  }
}

void find_sqlite(benchmark::State& state) {
  Database db;
  fill_sqlite(db, rows_of(state.range(0)));
  const std::vector<std::int32_t> keys = some_of(state.range(0), kManyAccesses);
  Statement find(db, "SELECT * FROM parts WHERE id=?");
  Row r;
  for (auto _ : state) {
    const Timer timer;
    db.run("BEGIN");
    for (const std::int32_t key : keys) {
      if (!find.integer(1, key).step()) give_up("find", key);
      read_row(find, r);
      benchmark::DoNotOptimize(r);
      find.reset();
    }
    db.run("COMMIT");
    timer.stop(state, std::ssize(keys));
  }
}

void find_limit(benchmark::State& state) {
  std::vector<std::int32_t> sorted(static_cast<std::size_t>(state.range(0)));
  std::iota(sorted.begin(), sorted.end(), 0);
  const std::vector<std::int32_t> keys = some_of(state.range(0), kManyAccesses);
  for (auto _ : state) {
    const Timer timer;
    for (const std::int32_t key : keys) {
      benchmark::DoNotOptimize(std::lower_bound(sorted.begin(), sorted.end(), key));
    }
    timer.stop(state, std::ssize(keys));
  }
}

// In a column without index: measure holds the value in the last row only, so each search reads all.
void scan_ours(benchmark::State& state) {
  OpenFile file;
  const std::vector<Row> all = rows_of(state.range(0));
  fill_table(all);
  Row r;
  for (auto _ : state) {
    TEV8R1_PF_reset_table("parts");
    const Timer timer;
    MUST(TEV8R1_PF_get_row_by_value("parts", 0, "measure", &all.back().measure, &r));
    timer.stop(state, state.range(0));
  }
}

void scan_sqlite(benchmark::State& state) {
  Database db;
  const std::vector<Row> all = rows_of(state.range(0));
  fill_sqlite(db, all);
  Statement find(db, "SELECT * FROM parts WHERE measure=?");
  Row r;
  for (auto _ : state) {
    const Timer timer;
    if (!find.real(1, all.back().measure).step()) give_up("scan", 0);
    read_row(find, r);
    timer.stop(state, state.range(0));
    find.reset();
  }
}

void scan_limit(benchmark::State& state) {
  const std::vector<Row> all = rows_of(state.range(0));
  for (auto _ : state) {
    double sum = 0;
    const Timer timer;
    for (const Row& r : all) sum += r.measure;
    timer.stop(state, state.range(0));
    benchmark::DoNotOptimize(sum);
  }
}

std::int64_t few(std::int64_t n) { return n > 10'000 ? kFewOperations : n / 10; }

void delete_ours(benchmark::State& state) {
  for (auto _ : state) {
    OpenFile file;
    fill_table(rows_of(state.range(0)));
    const std::vector<std::int32_t> which =
        some_of(state.range(0) - kFewOperations / 2, few(state.range(0)));
    Row r;
    const Timer timer;
    for (const std::int32_t pos : which) {
      if (TEV8R1_PF_get_row_by_pos("parts", pos % static_cast<std::int32_t>(state.range(0) / 2),
                                   &r) != PF_NORMAL)
        continue;
      MUST(TEV8R1_PF_delete_row("parts"));
    }
    timer.stop(state, std::ssize(which));
  }
}

void delete_sqlite(benchmark::State& state) {
  for (auto _ : state) {
    Database db;
    fill_sqlite(db, rows_of(state.range(0)));
    const std::vector<std::int32_t> which = some_of(state.range(0), few(state.range(0)));
    Statement erase(db, "DELETE FROM parts WHERE id=?");
    const Timer timer;
    db.run("BEGIN");
    for (const std::int32_t id : which) erase.integer(1, id).once();
    db.run("COMMIT");
    timer.stop(state, std::ssize(which));
  }
}

void replace_ours(benchmark::State& state) {
  OpenFile file;
  fill_table(rows_of(state.range(0)));
  const std::vector<std::int32_t> which = some_of(state.range(0), few(state.range(0)));
  Row r;
  for (auto _ : state) {
    const Timer timer;
    for (const std::int32_t pos : which) {
      MUST(TEV8R1_PF_get_row_by_pos("parts", pos, &r));
      r.group = (r.group + 7919) % kSpread;
      MUST(TEV8R1_PF_replace_row("parts", &r));
    }
    timer.stop(state, std::ssize(which));
  }
}

void replace_sqlite(benchmark::State& state) {
  Database db;
  fill_sqlite(db, rows_of(state.range(0)));
  const std::vector<std::int32_t> which = some_of(state.range(0), few(state.range(0)));
  Statement change(db, "UPDATE parts SET grp=(grp+7919)%1000000000 WHERE id=?");
  for (auto _ : state) {
    const Timer timer;
    db.run("BEGIN");
    for (const std::int32_t id : which) change.integer(1, id).once();
    db.run("COMMIT");
    timer.stop(state, std::ssize(which));
  }
}

void save_ours(benchmark::State& state) {
  OpenFile file;
  fill_table(rows_of(state.range(0)));
  time_save(state, state.range(0));
}

void save_sqlite(benchmark::State& state) {
  Database db;
  fill_sqlite(db, rows_of(state.range(0)));
  const std::string path = folder().file("saved.db");
  warm_memory();
  for (auto _ : state) {
    std::filesystem::remove(path);
    const Timer timer;
    sqlite3_int64 size = 0;
    unsigned char* image = sqlite3_serialize(db.get(), "main", &size, 0);
    write_plainly(path, {reinterpret_cast<const char*>(image), static_cast<std::size_t>(size)});
    timer.stop(state, state.range(0));
    sqlite3_free(image);
  }
}

std::string saved_table(std::int64_t n) {
  const std::string path = folder().file("table.pf");
  OpenFile file;
  fill_table(rows_of(n));
  MUST(TEV8R1_PF_save(path.c_str()));
  return path;
}

void save_limit(benchmark::State& state) {
  time_write(state, saved_table(state.range(0)), state.range(0));
}

void save_in_place_ours(benchmark::State& state) {
  OpenFile file;
  fill_table(rows_of(state.range(0)));
  for (auto _ : state) {
    const Timer timer(Timer::Clock::kWall);
    MUST(TEV8R1_PF_save(nullptr));
    timer.stop(state, state.range(0));
  }
}

// SQLite's defaults put every page into a journal and wait for the disk, as our save waits for it.
void save_in_place_sqlite(benchmark::State& state) {
  Database db;
  fill_sqlite(db, rows_of(state.range(0)));
  const std::string path = folder().file("saved.db");
  std::filesystem::remove(path);
  const Database to(path, Settings::kDefault);
  backup(db, to);
  for (auto _ : state) {
    const Timer timer(Timer::Clock::kWall);
    backup(db, to);
    timer.stop(state, state.range(0));
  }
}

void save_in_place_limit(benchmark::State& state) {
  const std::vector<char> bytes = contents(saved_table(state.range(0)));
  const std::string path = folder().file("saved.pf"), beside = path + ".new";
  write_plainly(path, bytes);
  for (auto _ : state) {
    const Timer timer(Timer::Clock::kWall);
    write_and_sync(beside, bytes);
    std::filesystem::rename(beside, path);
    timer.stop(state, state.range(0));
  }
}

void open_ours(benchmark::State& state) {
  time_open(state, saved_table(state.range(0)), state.range(0));
}

void open_sqlite(benchmark::State& state) {
  const std::string path = folder().file("table.db");
  std::filesystem::remove(path);
  {
    Database db(path);
    fill_sqlite(db, rows_of(state.range(0)));
  }
  warm_memory();
  for (auto _ : state) {
    const Timer timer;
    const Database db(path);
    read_all_sqlite(db, "SELECT * FROM parts");
    timer.stop(state, state.range(0));
  }
}

void open_limit(benchmark::State& state) {
  time_read(state, saved_table(state.range(0)), state.range(0));
}

void dump_ours(benchmark::State& state) {
  OpenFile file;
  fill_table(rows_of(state.range(0)));
  const std::string path = folder().file("dump.txt");
  for (auto _ : state) {
    const Timer timer;
    MUST(TEV8R1_PF_dump_table("parts", path.c_str()));
    timer.stop(state, state.range(0));
  }
}

void list_ours(benchmark::State& state) {
  OpenFile file;
  fill_table(rows_of(state.range(0)));
  MUST(TEV8R1_PF_define_table_search("parts", "group"));
  const std::string path = folder().file("dump.txt");
  const char columns[3][TEVPF_NAME_SIZE] = {"measure", "id", "group"};
  for (auto _ : state) {
    const Timer timer;
    MUST(TEV8R1_PF_print_table("parts", path.c_str(), 0, 3, columns, 0, PF_END_POS));
    timer.stop(state, state.range(0));
  }
}

void print_row(std::FILE* out, const Row& r) {
  char line[128];
  const int length = std::snprintf(line, sizeof line, " %8d  %-20s  %12.6g  %6d  %11d\n", r.id,
                                   r.name, r.measure, r.kind, r.group);
  std::fwrite(line, 1, static_cast<std::size_t>(length), out);
}

void dump_sqlite(benchmark::State& state) {
  Database db;
  fill_sqlite(db, rows_of(state.range(0)));
  const std::string path = folder().file("dump.txt");
  for (auto _ : state) {
    const Timer timer;
    std::FILE* out = std::fopen(path.c_str(), "w");
    Statement all(db, "SELECT * FROM parts");
    Row r;
    while (all.step()) {
      read_row(all, r);
      print_row(out, r);
    }
    std::fclose(out);
    timer.stop(state, state.range(0));
  }
}

void dump_limit(benchmark::State& state) {
  const std::vector<Row> all = rows_of(state.range(0));
  const std::string path = folder().file("dump.txt");
  for (auto _ : state) {
    const Timer timer;
    std::FILE* out = std::fopen(path.c_str(), "w");
    for (const Row& r : all) print_row(out, r);
    std::fclose(out);
    timer.stop(state, state.range(0));
  }
}

void list_sqlite(benchmark::State& state) {
  Database db;
  fill_sqlite(db, rows_of(state.range(0)));
  const std::string path = folder().file("dump.txt");
  for (auto _ : state) {
    const Timer timer;
    std::FILE* out = std::fopen(path.c_str(), "w");
    Statement all(db, "SELECT measure, id, grp FROM parts ORDER BY grp");
    while (all.step()) {
      std::fprintf(out, " %12.6g  %8d  %11d\n", sqlite3_column_double(all.get(), 0),
                   sqlite3_column_int(all.get(), 1), sqlite3_column_int(all.get(), 2));
    }
    std::fclose(out);
    timer.stop(state, state.range(0));
  }
}

void list_limit(benchmark::State& state) {
  const std::vector<Row> all = rows_of(state.range(0));
  const std::vector<std::int32_t> order = shuffled(state.range(0));
  const std::string path = folder().file("dump.txt");
  for (auto _ : state) {
    const Timer timer;
    std::FILE* out = std::fopen(path.c_str(), "w");
    char line[128];
    for (const std::int32_t i : order) {
      const Row& r = all[static_cast<std::size_t>(i)];
      const int length =
          std::snprintf(line, sizeof line, " %12.6g  %8d  %11d\n", r.measure, r.id, r.group);
      std::fwrite(line, 1, static_cast<std::size_t>(length), out);
    }
    std::fclose(out);
    timer.stop(state, state.range(0));
  }
}

const int registered = [] {
  add("table append in order", "tevpf", append_ours<Order::kAscending, false>);
  add("table append in order", "sqlite", append_sqlite<Order::kAscending>);
  add("table append at random", "tevpf", append_ours<Order::kRandom, false>);
  add("table append at random", "sqlite", append_sqlite<Order::kRandom>);
  add("table append in order unchecked", "tevpf", append_ours<Order::kAscending, true>);
  add("table append in order unchecked", "sqlite", append_sqlite<Order::kAscending>);
  add("table append at random unchecked", "tevpf", append_ours<Order::kRandom, true>);
  add("table append at random unchecked", "sqlite", append_sqlite<Order::kRandom>);
  add("table append few values", "tevpf", append_ours<Order::kFewValues, false>);
  add("table append few values", "sqlite", append_sqlite<Order::kFewValues>);
  add("table read in index order", "tevpf", read_ordered_ours, kFewPasses);
  add("table read in index order", "sqlite", read_ordered_sqlite, kFewPasses);
  add("table read in index order", "limit: gather", read_ordered_limit, kFewPasses);
  add("table find indexed", "tevpf", find_ours);
  add("table find indexed", "sqlite", find_sqlite);
  add("table find indexed", "limit: binary search", find_limit);
  add("table find unindexed", "tevpf", scan_ours, kManyPasses);
  add("table find unindexed", "sqlite", scan_sqlite, kManyPasses);
  add("table find unindexed", "limit: read 8 of 48 bytes", scan_limit, kManyPasses);
  add("table delete", "tevpf", delete_ours);
  add("table delete", "sqlite", delete_sqlite);
  add("table replace", "tevpf", replace_ours);
  add("table replace", "sqlite", replace_sqlite);
  add("table save", "tevpf", save_ours, kFewPasses);
  add("table save", "sqlite", save_sqlite, kFewPasses);
  add("table save", "limit: write", save_limit, kFewPasses);
  add("table save in place", "tevpf", save_in_place_ours, kFewPasses);
  add("table save in place", "sqlite defaults", save_in_place_sqlite, kFewPasses);
  add("table save in place", "limit: write sync rename", save_in_place_limit, kFewPasses);
  add("table open", "tevpf", open_ours, kFewPasses);
  add("table open", "sqlite", open_sqlite, kFewPasses);
  add("table open", "limit: read", open_limit, kFewPasses);
  add("table dump", "tevpf", dump_ours, kFewPasses);
  add("table dump", "sqlite", dump_sqlite, kFewPasses);
  add("table dump", "limit: snprintf", dump_limit, kFewPasses);
  add("table listing", "tevpf", list_ours, kFewPasses);
  add("table listing", "sqlite", list_sqlite, kFewPasses);
  add("table listing", "limit: snprintf", list_limit, kFewPasses);
  return 0;
}();

}  // namespace
