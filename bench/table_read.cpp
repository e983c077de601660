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
// which is half of the rows on average, or random ones that none has, which is all of them.
enum class Sought { kPresent, kAbsent };

struct Searches {
  Searches(const std::vector<Row>& all, Sought sought) : present(sought == Sought::kPresent) {
    constexpr std::int64_t kRowsInAll = 50'000'000;
    const std::int64_t n = std::ssize(all),
                       count = std::clamp<std::int64_t>(kRowsInAll / n, 50, 1'000);
    for (const std::int32_t i : random_numbers(count, n)) {
      values.push_back(present ? all[i].measure : row(-1 - i).measure);
      rows_gone_through += present ? i + 1 : n;
    }
  }

  bool present;
  std::vector<double> values;
  std::int64_t rows_gone_through = 0;
};

// The next row of the table that has the value; false when it is not as expected.
bool scan(double value, bool present) {
  Row r;
  MUST(TEV8R1_PF_reset_table("parts"));
  const TEVPF_STATUS status = TEV8R1_PF_get_row_by_value("parts", 0, "measure", &value, &r);
  return present ? status == PF_NORMAL && r.measure == value : status == PF_NOTFOUND;
}

template <Sought sought>
void scan_ours(benchmark::State& state) {
  const OpenFile file;
  const std::vector<Row> all = rows_of(state.range(0));
  fill_table(all);
  const Searches searches(all, sought);
  for (auto _ : state) {
    const Timer timer;
    for (const double value : searches.values) {
      if (!scan(value, searches.present)) give_up("scan", 0);
    }
    timer.stop(state, searches.rows_gone_through);
  }
}

template <Sought sought>
void scan_sqlite(benchmark::State& state) {
  Database db;
  const std::vector<Row> all = rows_of(state.range(0));
  fill_sqlite(db, all);
  const Searches searches(all, sought);
  Statement find(db, "SELECT * FROM parts WHERE measure=?");
  Row r;
  for (auto _ : state) {
    const Timer timer;
    for (const double value : searches.values) {
      if (find.real(1, value).step() != searches.present) give_up("scan", 0);
      if (searches.present) read_row(find, r);
      benchmark::DoNotOptimize(r);
      find.reset();
    }
    timer.stop(state, searches.rows_gone_through);
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
  const Searches searches(all, Sought::kPresent);
  Row r;
  for (auto _ : state) {
    double seconds = 0;
    for (const double value : searches.values) {
      MUST(TEV8R1_PF_get_row_by_pos("parts", 0, &r));
      r.kind = static_cast<std::int16_t>(r.kind ^ 1);
      MUST(TEV8R1_PF_replace_row("parts", &r));
      const Timer timer;
      if (!scan(value, true)) give_up("scan", 0);
      seconds += timer.seconds();
    }
    Timer::record(state, seconds, searches.rows_gone_through);
  }
}

const int registered = [] {
  add("table read in index order", "tevpf", read_ordered_ours, kFewPasses);
  add("table read in index order", "sqlite", read_ordered_sqlite, kFewPasses);
  add("table read in index order", "limit: gather", read_ordered_limit, kFewPasses);
  add("table find indexed", "tevpf", find_ours);
  add("table find indexed", "sqlite", find_sqlite);
  add("table find indexed", "limit: binary search", find_limit);
  add("table find unindexed", "tevpf", scan_ours<Sought::kPresent>);
  add("table find unindexed", "sqlite", scan_sqlite<Sought::kPresent>);
  add("table find unindexed", "limit: read 8 of 48 bytes", scan_limit, kManyPasses);
  add("table find unindexed, absent", "tevpf", scan_ours<Sought::kAbsent>);
  add("table find unindexed, absent", "sqlite", scan_sqlite<Sought::kAbsent>);
  add("table find unindexed, absent", "limit: read 8 of 48 bytes", scan_limit, kManyPasses);
  add("table find unindexed after a change", "tevpf", scan_changing_ours, 1,
      {10'000, 100'000, 1'000'000});
  add("table find unindexed after a change", "sqlite", scan_sqlite<Sought::kPresent>, 1,
      {10'000, 100'000, 1'000'000});
  return 0;
}();

}  // namespace
