// Saving tables, into new files and in place, and opening them.
#include "parts_table.h"

namespace {

using namespace bench;

void save_ours(benchmark::State& state) {
  OpenFile file;
  fill_table(rows_of(state.range(0)));
  time_save(state, state.range(0));
}

void save_sqlite(benchmark::State& state) {
  Database db;
  fill_sqlite(db, rows_of(state.range(0)));
  time_serialize(state, db, state.range(0));
}

void save_limit(benchmark::State& state) {
  time_write(state, saved_table(rows_of(state.range(0))), state.range(0));
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
  const std::vector<char> bytes = contents(saved_table(rows_of(state.range(0))));
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
  time_open(state, saved_table(rows_of(state.range(0))), state.range(0));
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
  time_read(state, saved_table(rows_of(state.range(0))), state.range(0));
}

const int registered = [] {
  add("table save", "tevpf", save_ours, kFewPasses);
  add("table save", "sqlite", save_sqlite, kFewPasses);
  add("table save", "limit: write", save_limit, kFewPasses);
  add("table save in place", "tevpf", save_in_place_ours, kFewPasses);
  add("table save in place", "sqlite defaults", save_in_place_sqlite, kFewPasses);
  add("table save in place", "limit: write sync rename", save_in_place_limit, kFewPasses);
  add("table open", "tevpf", open_ours, kFewPasses);
  add("table open", "sqlite", open_sqlite, kFewPasses);
  add("table open", "limit: read", open_limit, kFewPasses);
  return 0;
}();

}  // namespace
