// Reading rows in the order of an index, and finding them by value with and without one.
#include "parts_table.h"

namespace {

using namespace bench;

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

// In a column without index, of random numbers: rows are gone through in the order in which they
// were added, by SQLite too, and the time is that of one row. Sought are values that some row has,
// which is half of the rows on average, or the last row's, which is all of them.
enum class Sought { kAnyRow, kLastRow };

std::vector<std::int32_t> rows_to_find(std::int64_t n, Sought sought) {
  constexpr std::int64_t kRowsInAll = 50'000'000;
  const std::int64_t count = std::clamp<std::int64_t>(kRowsInAll / n, 50, 1'000);
  if (sought == Sought::kAnyRow) return random_numbers(count, n);
  return std::vector<std::int32_t>(static_cast<std::size_t>(count),
                                   static_cast<std::int32_t>(n - 1));
}

std::int64_t rows_gone_through(const std::vector<std::int32_t>& found) {
  return std::accumulate(found.begin(), found.end(), std::ssize(found));
}

template <Sought sought>
void scan_ours(benchmark::State& state) {
  const OpenFile file;
  const std::vector<Row> all = rows_of(state.range(0));
  fill_table(all);
  const std::vector<std::int32_t> which = rows_to_find(state.range(0), sought);
  Row r;
  for (auto _ : state) {
    const Timer timer;
    for (const std::int32_t i : which) {
      MUST(TEV8R1_PF_reset_table("parts"));
      MUST(TEV8R1_PF_get_row_by_value("parts", 0, "measure", &all[i].measure, &r));
    }
    timer.stop(state, rows_gone_through(which));
    if (r.id != which.back()) give_up("scan", r.id);
  }
}

template <Sought sought>
void scan_sqlite(benchmark::State& state) {
  Database db;
  const std::vector<Row> all = rows_of(state.range(0));
  fill_sqlite(db, all);
  const std::vector<std::int32_t> which = rows_to_find(state.range(0), sought);
  Statement find(db, "SELECT * FROM parts WHERE measure=?");
  Row r;
  for (auto _ : state) {
    const Timer timer;
    for (const std::int32_t i : which) {
      if (!find.real(1, all[i].measure).step()) give_up("scan", 0);
      read_row(find, r);
      find.reset();
    }
    timer.stop(state, rows_gone_through(which));
    if (r.id != which.back()) give_up("scan", r.id);
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

// Each search after a change of some row, whose time does not count: nothing that searches leave
// behind helps the next one.
void scan_changing_ours(benchmark::State& state) {
  const OpenFile file;
  const std::vector<Row> all = rows_of(state.range(0));
  fill_table(all);
  const std::vector<std::int32_t> which = rows_to_find(state.range(0), Sought::kAnyRow);
  Row r;
  for (auto _ : state) {
    double seconds = 0;
    for (const std::int32_t i : which) {
      MUST(TEV8R1_PF_get_row_by_pos("parts", 0, &r));
      r.kind = static_cast<std::int16_t>(r.kind ^ 1);
      MUST(TEV8R1_PF_replace_row("parts", &r));
      MUST(TEV8R1_PF_reset_table("parts"));
      const Timer timer;
      MUST(TEV8R1_PF_get_row_by_value("parts", 0, "measure", &all[i].measure, &r));
      seconds += timer.seconds();
    }
    Timer::record(state, seconds, rows_gone_through(which));
  }
}

const int registered = [] {
  add("table read in index order", "tevpf", read_ordered_ours, kFewPasses);
  add("table read in index order", "sqlite", read_ordered_sqlite, kFewPasses);
  add("table read in index order", "limit: gather", read_ordered_limit, kFewPasses);
  add("table find indexed", "tevpf", find_ours);
  add("table find indexed", "sqlite", find_sqlite);
  add("table find indexed", "limit: binary search", find_limit);
  add("table find unindexed", "tevpf", scan_ours<Sought::kAnyRow>);
  add("table find unindexed", "sqlite", scan_sqlite<Sought::kAnyRow>);
  add("table find unindexed", "limit: read 8 of 48 bytes", scan_limit, kManyPasses);
  add("table find unindexed, last row", "tevpf", scan_ours<Sought::kLastRow>);
  add("table find unindexed, last row", "sqlite", scan_sqlite<Sought::kLastRow>);
  add("table find unindexed, last row", "limit: read 8 of 48 bytes", scan_limit, kManyPasses);
  add("table find unindexed after a change", "tevpf", scan_changing_ours);
  add("table find unindexed after a change", "sqlite", scan_sqlite<Sought::kAnyRow>);
  return 0;
}();

}  // namespace
