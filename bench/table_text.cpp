// Dumps and listings of tables as text.
#include "parts_table.h"

namespace {

using namespace bench;

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
  add("table dump", "tevpf", dump_ours, kFewPasses);
  add("table dump", "sqlite", dump_sqlite, kFewPasses);
  add("table dump", "limit: snprintf", dump_limit, kFewPasses);
  add("table listing", "tevpf", list_ours, kFewPasses);
  add("table listing", "sqlite", list_sqlite, kFewPasses);
  add("table listing", "limit: snprintf", list_limit, kFewPasses);
  return 0;
}();

}  // namespace
