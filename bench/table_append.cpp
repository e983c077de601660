// Appending rows, checked and unchecked, in several orders; with searches in between; after opening.
#include "parts_table.h"

namespace {

using namespace bench;

enum class Order {
  kAscending,     // both indexes
  kAscendingIds,  // the group is random
  kRandom,        // both
  kFewValues,     // ascending ids, few groups
};

std::vector<Row> rows_to_append(std::int64_t n, Order order) {
  if (order == Order::kRandom) return shuffled_rows(n);
  std::vector<Row> all = rows_of(n, order == Order::kFewValues ? kFewGroups : kSpread);
  if (order == Order::kAscending) {
    for (Row& r : all) r.group = r.id;
  }
  return all;
}

// The rows of a workload: those that are there before, and those that are appended.
struct Rows {
  Rows(std::int64_t n, Order order)
      : all(rows_to_append(n, order)),
        before(all.data(),
               order == Order::kAscending ? 0 : static_cast<std::size_t>(already_there(n))),
        appended(all.data() + before.size(), all.size() - before.size()) {}

  std::vector<Row> all;
  std::span<const Row> before;
  std::span<const Row> appended;
};

template <Order order, bool interactive>
void append_ours(benchmark::State& state) {
  const Rows rows(state.range(0), order);
  warm_memory();
  for (auto _ : state) {
    const OpenFile file;
    fill_table(rows.before);
    if (interactive) MUST(TEV8R1_set_interactive_table("parts"));
    const Timer timer;
    for (const Row& r : rows.appended) MUST(TEV8R1_PF_add_row("parts", &r));
    timer.stop(state, std::ssize(rows.appended));
    MUST(TEV8R1_turn_off_interactive());
  }
}

template <Order order>
void append_sqlite(benchmark::State& state) {
  const Rows rows(state.range(0), order);
  warm_memory();
  for (auto _ : state) {
    Database db;
    fill_sqlite(db, rows.before);
    const Timer timer;
    db.run("BEGIN");
    Statement into(db, kInsert);
    for (const Row& r : rows.appended) insert(into, r);
    db.run("COMMIT");
    timer.stop(state, std::ssize(rows.appended));
  }
}

// After each append, one of the rows so far, at random. The time is that of both.
std::vector<std::int32_t> ids_to_find(const Rows& rows) {
  std::mt19937 random(kSeed);
  std::vector<std::int32_t> ids;
  for (std::size_t there = rows.before.size() + 1; there <= rows.all.size(); ++there) {
    ids.push_back(rows.all[std::uniform_int_distribution<std::size_t>(0, there - 1)(random)].id);
  }
  return ids;
}

void append_and_find_ours(benchmark::State& state) {
  const Rows rows(state.range(0), Order::kRandom);
  const std::vector<std::int32_t> ids = ids_to_find(rows);
  warm_memory();
  for (auto _ : state) {
    const OpenFile file;
    fill_table(rows.before);
    MUST(TEV8R1_PF_define_table_search("parts", "id"));
    Row r;
    const Timer timer;
    for (std::size_t i = 0; i < ids.size(); ++i) {
      MUST(TEV8R1_PF_add_row("parts", &rows.appended[i]));
      find_id(ids[i], r);
    }
    timer.stop(state, std::ssize(ids));
  }
}

void append_and_find_sqlite(benchmark::State& state) {
  const Rows rows(state.range(0), Order::kRandom);
  const std::vector<std::int32_t> ids = ids_to_find(rows);
  warm_memory();
  for (auto _ : state) {
    Database db;
    fill_sqlite(db, rows.before);
    Statement into(db, kInsert), find(db, kFind);
    Row r;
    const Timer timer;
    db.run("BEGIN");
    for (std::size_t i = 0; i < ids.size(); ++i) {
      insert(into, rows.appended[i]);
      find_id(find, ids[i], r);
    }
    db.run("COMMIT");
    timer.stop(state, std::ssize(ids));
  }
}

// The first appends to a table that a file brought, with ids between those that are there. What it
// costs to make a table that has just been read ready for changes is part of the time.
constexpr std::int64_t kFirstAppends = 1'000;

std::vector<Row> first_appends(std::int64_t n) {
  NewIds ids(n);
  std::vector<Row> rows;
  for (std::int64_t i = 0; i < kFirstAppends; ++i) rows.push_back(row(ids.next()));
  return rows;
}

void append_after_opening_ours(benchmark::State& state) {
  const std::string path = saved_table(shuffled_rows(state.range(0), NewIds::kGap));
  const std::vector<Row> rows = first_appends(state.range(0));
  warm_memory();
  for (auto _ : state) {
    MUST(TEV8R1_PF_open(path.c_str()));
    const Timer timer;
    for (const Row& r : rows) MUST(TEV8R1_PF_add_row("parts", &r));
    timer.stop(state, std::ssize(rows));
    MUST(TEV8R1_PF_close(0));
  }
}

void append_after_opening_sqlite(benchmark::State& state) {
  const std::vector<Row> before = shuffled_rows(state.range(0), NewIds::kGap);
  const std::vector<Row> rows = first_appends(state.range(0));
  warm_memory();
  for (auto _ : state) {
    Database db;
    fill_sqlite(db, before);
    Statement into(db, kInsert);
    const Timer timer;
    db.run("BEGIN");
    for (const Row& r : rows) insert(into, r);
    db.run("COMMIT");
    timer.stop(state, std::ssize(rows));
  }
}

const int registered = [] {
  add("table append in order", "tevpf", append_ours<Order::kAscending, false>);
  add("table append in order", "sqlite", append_sqlite<Order::kAscending>);
  add("table append in order, second index at random", "tevpf",
      append_ours<Order::kAscendingIds, false>);
  add("table append in order, second index at random", "sqlite",
      append_sqlite<Order::kAscendingIds>);
  add("table append at random", "tevpf", append_ours<Order::kRandom, false>);
  add("table append at random", "sqlite", append_sqlite<Order::kRandom>);
  add("table append in order unchecked", "tevpf", append_ours<Order::kAscending, true>);
  add("table append in order unchecked", "sqlite", append_sqlite<Order::kAscending>);
  add("table append at random unchecked", "tevpf", append_ours<Order::kRandom, true>);
  add("table append at random unchecked", "sqlite", append_sqlite<Order::kRandom>);
  add("table append few values", "tevpf", append_ours<Order::kFewValues, false>);
  add("table append few values", "sqlite", append_sqlite<Order::kFewValues>);
  add("table append and find in turn", "tevpf", append_and_find_ours);
  add("table append and find in turn", "sqlite", append_and_find_sqlite);
  add("table first 1000 appends after opening", "tevpf", append_after_opening_ours, kFewPasses);
  add("table first 1000 appends after opening", "sqlite", append_after_opening_sqlite);
  return 0;
}();

}  // namespace
