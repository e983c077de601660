// Deleting, replacing, inserting and moving rows of a table that is there, at random and in the
// places where programs do it most.
#include "parts_table.h"

namespace {

using namespace bench;

// The ids of rows to be changed, at random.
std::vector<std::int32_t> ids_to_change(std::int64_t n) { return some_of(n, changes(n)); }

void delete_ours(benchmark::State& state) {
  const std::vector<Row> rows = shuffled_rows(state.range(0));
  const std::vector<std::int32_t> ids = ids_to_change(state.range(0));
  for (auto _ : state) {
    const OpenFile file;
    fill_table(rows);
    MUST(TEV8R1_PF_define_table_search("parts", "id"));
    Row r;
    const Timer timer;
    for (const std::int32_t id : ids) {
      find_id(id, r);
      MUST(TEV8R1_PF_delete_row("parts"));
    }
    timer.stop(state, std::ssize(ids));
  }
}

void delete_these_sqlite(benchmark::State& state, const std::vector<std::int32_t>& ids) {
  const std::vector<Row> rows = shuffled_rows(state.range(0));
  for (auto _ : state) {
    Database db;
    fill_sqlite(db, rows);
    Statement erase(db, kDelete);
    const Timer timer;
    db.run("BEGIN");
    for (const std::int32_t id : ids) erase.integer(1, id).once();
    db.run("COMMIT");
    timer.stop(state, std::ssize(ids));
  }
}

void delete_sqlite(benchmark::State& state) {
  delete_these_sqlite(state, ids_to_change(state.range(0)));
}

// Replacing: the group gets another random value.
void replace_ours(benchmark::State& state) {
  const OpenFile file;
  fill_table(shuffled_rows(state.range(0)));
  MUST(TEV8R1_PF_define_table_search("parts", "id"));
  const std::vector<std::int32_t> ids = ids_to_change(state.range(0));
  std::mt19937 random(kSeed);
  std::uniform_int_distribution<std::int32_t> group(0, kSpread - 1);
  Row r;
  for (auto _ : state) {
    const Timer timer;
    for (const std::int32_t id : ids) {
      find_id(id, r);
      r.group = group(random);
      MUST(TEV8R1_PF_replace_row("parts", &r));
    }
    timer.stop(state, std::ssize(ids));
  }
}

void replace_sqlite(benchmark::State& state) {
  Database db;
  fill_sqlite(db, shuffled_rows(state.range(0)));
  const std::vector<std::int32_t> ids = ids_to_change(state.range(0));
  std::mt19937 random(kSeed);
  std::uniform_int_distribution<std::int32_t> group(0, kSpread - 1);
  Statement change(db, kReplace);
  for (auto _ : state) {
    const Timer timer;
    db.run("BEGIN");
    for (const std::int32_t id : ids) change.integer(1, group(random)).integer(2, id).once();
    db.run("COMMIT");
    timer.stop(state, std::ssize(ids));
  }
}

// Inserting in front of random rows.
void insert_ours(benchmark::State& state) {
  const std::vector<Row> rows = shuffled_rows(state.range(0) + moves(state.range(0)));
  const std::span before(rows.data(), static_cast<std::size_t>(state.range(0)));
  const std::span inserted(rows.data() + before.size(), rows.size() - before.size());
  const std::vector<std::int32_t> places = random_numbers(std::ssize(inserted), state.range(0));
  for (auto _ : state) {
    const OpenFile file;
    fill_table(before);
    const Timer timer;
    for (std::size_t i = 0; i < inserted.size(); ++i)
      MUST(TEV8R1_PF_add_row_by_pos("parts", &inserted[i], places[i]));
    timer.stop(state, std::ssize(inserted));
  }
}

void move_ours(benchmark::State& state) {
  const OpenFile file;
  fill_table(shuffled_rows(state.range(0)));
  const std::int64_t count = moves(state.range(0));
  const std::vector<std::int32_t> places = random_numbers(2 * count, state.range(0));
  for (auto _ : state) {
    const Timer timer;
    for (std::size_t i = 0; i < places.size(); i += 2)
      MUST(TEV8R1_PF_move_row("parts", places[i], places[i + 1]));
    timer.stop(state, count);
  }
}

// The last row, again and again.
void delete_last_ours(benchmark::State& state) {
  const std::vector<Row> rows = shuffled_rows(state.range(0));
  const auto count = static_cast<std::int32_t>(changes(state.range(0)));
  for (auto _ : state) {
    const OpenFile file;
    fill_table(rows);
    Row r;
    const Timer timer;
    for (std::int32_t i = 1; i <= count; ++i) {
      MUST(TEV8R1_PF_get_row_by_pos("parts", static_cast<std::int32_t>(rows.size()) - i, &r));
      MUST(TEV8R1_PF_delete_row("parts"));
    }
    timer.stop(state, count);
  }
}

void delete_last_sqlite(benchmark::State& state) {
  const std::vector<Row> rows = shuffled_rows(state.range(0));
  std::vector<std::int32_t> ids;
  for (std::int64_t i = 0; i < changes(state.range(0)); ++i)
    ids.push_back(rows[rows.size() - 1 - static_cast<std::size_t>(i)].id);
  delete_these_sqlite(state, ids);
}

// A row is appended and deleted again, in turn. The time is that of both.
void delete_newest_ours(benchmark::State& state) {
  const std::vector<Row> rows = shuffled_rows(state.range(0) + changes(state.range(0)));
  const std::span before(rows.data(), static_cast<std::size_t>(state.range(0)));
  const std::span appended(rows.data() + before.size(), rows.size() - before.size());
  for (auto _ : state) {
    const OpenFile file;
    fill_table(before);
    Row r;
    const Timer timer;
    for (const Row& newest : appended) {
      MUST(TEV8R1_PF_add_row("parts", &newest));
      MUST(TEV8R1_PF_get_row_by_pos("parts", static_cast<std::int32_t>(before.size()), &r));
      MUST(TEV8R1_PF_delete_row("parts"));
    }
    timer.stop(state, std::ssize(appended));
  }
}

void delete_newest_sqlite(benchmark::State& state) {
  const std::vector<Row> rows = shuffled_rows(state.range(0) + changes(state.range(0)));
  const std::span before(rows.data(), static_cast<std::size_t>(state.range(0)));
  const std::span appended(rows.data() + before.size(), rows.size() - before.size());
  for (auto _ : state) {
    Database db;
    fill_sqlite(db, before);
    Statement into(db, kInsert), erase(db, kDelete);
    const Timer timer;
    db.run("BEGIN");
    for (const Row& newest : appended) {
      insert(into, newest);
      erase.integer(1, newest.id).once();
    }
    db.run("COMMIT");
    timer.stop(state, std::ssize(appended));
  }
}

// To rows in random order, rows whose id and group are the greatest so far.
std::vector<Row> greatest_rows(std::int64_t n) {
  std::vector<Row> rows;
  for (std::int64_t i = 0; i < changes(n); ++i) {
    rows.push_back(row(static_cast<std::int32_t>(n + i)));
    rows.back().group = kSpread + static_cast<std::int32_t>(i);
  }
  return rows;
}

void append_greatest_ours(benchmark::State& state) {
  const std::vector<Row> before = shuffled_rows(state.range(0));
  const std::vector<Row> appended = greatest_rows(state.range(0));
  for (auto _ : state) {
    const OpenFile file;
    fill_table(before);
    const Timer timer;
    for (const Row& r : appended) MUST(TEV8R1_PF_add_row("parts", &r));
    timer.stop(state, std::ssize(appended));
  }
}

void append_greatest_sqlite(benchmark::State& state) {
  const std::vector<Row> before = shuffled_rows(state.range(0));
  const std::vector<Row> appended = greatest_rows(state.range(0));
  for (auto _ : state) {
    Database db;
    fill_sqlite(db, before);
    Statement into(db, kInsert);
    const Timer timer;
    db.run("BEGIN");
    for (const Row& r : appended) insert(into, r);
    db.run("COMMIT");
    timer.stop(state, std::ssize(appended));
  }
}

// A walk in the order of the ids, through all rows or so many, that deletes every other one. The
// time is that of two steps and one deletion.
void delete_every_other_ours(benchmark::State& state) {
  const std::vector<Row> rows = shuffled_rows(state.range(0));
  const std::int64_t count = moves(state.range(0));
  for (auto _ : state) {
    const OpenFile file;
    fill_table(rows);
    MUST(TEV8R1_PF_define_table_search("parts", "id"));
    MUST(TEV8R1_PF_reset_table("parts"));
    Row r;
    const Timer timer;
    for (std::int64_t i = 0; i < count; ++i) {
      MUST(TEV8R1_PF_get_next_row("parts", &r));
      MUST(TEV8R1_PF_get_next_row("parts", &r));
      MUST(TEV8R1_PF_delete_row("parts"));
    }
    timer.stop(state, count);
  }
}

void delete_every_other_sqlite(benchmark::State& state) {
  const std::vector<Row> rows = shuffled_rows(state.range(0));
  const std::int64_t count = moves(state.range(0));
  for (auto _ : state) {
    Database db;
    fill_sqlite(db, rows);
    Statement all(db, "SELECT * FROM parts ORDER BY id"), erase(db, kDelete);
    Row r;
    const Timer timer;
    db.run("BEGIN");
    for (std::int64_t i = 0; i < count; ++i) {
      all.step();
      read_row(all, r);
      benchmark::DoNotOptimize(r);
      all.step();
      read_row(all, r);
      erase.integer(1, r.id).once();
    }
    all.reset();
    db.run("COMMIT");
    timer.stop(state, count);
  }
}

const int registered = [] {
  add("table delete", "tevpf", delete_ours);
  add("table delete", "sqlite", delete_sqlite);
  add("table replace", "tevpf", replace_ours);
  add("table replace", "sqlite", replace_sqlite);
  add("table insert at a position", "tevpf", insert_ours);
  add("table move a row", "tevpf", move_ours);
  add("table delete the last row", "tevpf", delete_last_ours);
  add("table delete the last row", "sqlite", delete_last_sqlite);
  add("table append and delete the newest row", "tevpf", delete_newest_ours);
  add("table append and delete the newest row", "sqlite", delete_newest_sqlite);
  add("table append behind the greatest", "tevpf", append_greatest_ours);
  add("table append behind the greatest", "sqlite", append_greatest_sqlite);
  add("table walk and delete every other row", "tevpf", delete_every_other_ours);
  add("table walk and delete every other row", "sqlite", delete_every_other_sqlite);
  return 0;
}();

}  // namespace
