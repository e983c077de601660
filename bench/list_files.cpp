// Saving and opening lists: one long one, or many short ones.
#include <fstream>
#include <nlohmann/json.hpp>

#include "param_lists.h"

namespace {

using namespace bench;

void save_ours(benchmark::State& state) {
  OpenFile file;
  fill_list("list", names(state.range(0)));
  time_save(state, state.range(0));
}

void save_sqlite(benchmark::State& state) {
  Database db;
  fill_database(db, names(state.range(0)));
  time_serialize(state, db, state.range(0));
}

void save_sqlite_backup(benchmark::State& state) {
  Database db;
  fill_database(db, names(state.range(0)));
  time_backup(state, db, state.range(0));
}

void save_json(benchmark::State& state) {
  nlohmann::json all = nlohmann::json::array();
  const std::vector<std::string> every = names(state.range(0));
  for (std::int32_t i = 0; i < std::ssize(every); ++i) {
    nlohmann::json entry = {{"name", every[i]}, {"type", PF_TYPE_INT + i % 5},
                            {"units", "mm"},    {"max", 1e12},
                            {"min", -1e12},     {"precision", 12}};
    if (i % 2 == 0) entry["description"] = "measured at room temperature";
    if (i % 5 == 2)
      entry["value"] = "stainless steel";
    else
      entry["value"] = i * 0.125;
    all.push_back(std::move(entry));
  }
  const std::string path = folder().file("saved.json");
  warm_memory();
  for (auto _ : state) {
    std::filesystem::remove(path);
    const Timer timer;
    std::ofstream(path, std::ios::binary) << all;
    timer.stop(state, state.range(0));
  }
}

// Fetches each value once, as what it is.
std::int64_t read_everything(const Database& db) {
  Statement all(db, "SELECT list, name, type, units, description, value, max, min, prec FROM p");
  std::int64_t sum = 0;
  const auto text = [&](int column) {
    if (const auto* found = sqlite3_column_text(all.get(), column)) sum += found[0];
  };
  const auto integer = [&](int column) { sum += sqlite3_column_int(all.get(), column); };
  const auto real = [&](int column) {
    sum += static_cast<std::int64_t>(sqlite3_column_double(all.get(), column));
  };
  while (all.step()) {
    integer(0);
    text(1);
    const int type = sqlite3_column_int(all.get(), 2);
    text(3);
    text(4);
    if (type == PF_TYPE_STRING) {
      text(5);
    } else {
      real(5);
    }
    real(6);
    real(7);
    integer(8);
  }
  return sum;
}

// Opening: one list of n, or n lists of a few. All names of a workload are in one file each.
std::string saved_lists(std::int64_t lists, std::int64_t params) {
  const std::string path = folder().file("lists.pf");
  OpenFile file;
  const std::vector<std::string> all = names(params);
  for (std::int64_t list = 0; list < lists; ++list) {
    const std::string name = "list_" + std::to_string(list);
    fill_list(name.c_str(), all);
  }
  MUST(TEV8R1_PF_save(path.c_str()));
  return path;
}

void open_ours(benchmark::State& state, std::int64_t lists, std::int64_t params) {
  time_open(state, saved_lists(lists, params), lists == 1 ? params : lists);
}

void open_sqlite(benchmark::State& state, std::int64_t lists, std::int64_t params) {
  const std::string path = folder().file("lists.db");
  std::filesystem::remove(path);
  {
    Database db(path);
    fill_database(db, names(params), lists);
  }
  warm_memory();
  for (auto _ : state) {
    const Timer timer;
    const Database db(path);
    benchmark::DoNotOptimize(read_everything(db));
    timer.stop(state, lists == 1 ? params : lists);
  }
}

void open_limit(benchmark::State& state, std::int64_t lists, std::int64_t params) {
  time_read(state, saved_lists(lists, params), lists == 1 ? params : lists);
}

void save_limit(benchmark::State& state) {
  time_write(state, saved_lists(1, state.range(0)), state.range(0));
}

template <void (*Open)(benchmark::State&, std::int64_t, std::int64_t), std::int64_t Params>
void open_many(benchmark::State& state) {
  Open(state, state.range(0), Params);
}

template <void (*Open)(benchmark::State&, std::int64_t, std::int64_t)>
void open_one(benchmark::State& state) {
  Open(state, 1, state.range(0));
}

template <int Params>
void save_many_ours(benchmark::State& state) {
  MUST(TEV8R1_PF_open(saved_lists(state.range(0), Params).c_str()));
  time_save(state, state.range(0));
  MUST(TEV8R1_PF_close(0));
}

template <int Params>
void save_many_sqlite(benchmark::State& state) {
  Database db;
  fill_database(db, names(Params), state.range(0));
  time_serialize(state, db, state.range(0));
}

template <int Params>
void save_many_sqlite_backup(benchmark::State& state) {
  Database db;
  fill_database(db, names(Params), state.range(0));
  time_backup(state, db, state.range(0));
}

template <int Params>
void save_many_limit(benchmark::State& state) {
  time_write(state, saved_lists(state.range(0), Params), state.range(0));
}

const int registered = [] {
  add("list save", "tevpf", save_ours, kFewPasses);
  add("list save", "sqlite", save_sqlite, kFewPasses);
  add("list save", "sqlite backup", save_sqlite_backup, kFewPasses);
  add("list save", "json", save_json, kFewPasses);
  add("list save", "limit: write", save_limit, kFewPasses);
  add("list open", "tevpf", open_one<open_ours>, kFewPasses);
  add("list open", "sqlite", open_one<open_sqlite>, kFewPasses);
  add("list open", "limit: read", open_one<open_limit>, kFewPasses);
  const std::vector<std::int64_t> fives = {20'000, 40'000, 100'000};
  add("open lists of 5", "tevpf", open_many<open_ours, 5>, kFewPasses, fives);
  add("open lists of 5", "sqlite", open_many<open_sqlite, 5>, kFewPasses, fives);
  add("open lists of 5", "limit: read", open_many<open_limit, 5>, kFewPasses, fives);
  add("open lists of 50", "tevpf", open_many<open_ours, 50>, kFewPasses, {10'000});
  add("open lists of 50", "sqlite", open_many<open_sqlite, 50>, kFewPasses, {10'000});
  add("open lists of 50", "limit: read", open_many<open_limit, 50>, kFewPasses, {10'000});
  add("save lists of 5", "tevpf", save_many_ours<5>, kFewPasses, {100'000});
  add("save lists of 5", "sqlite", save_many_sqlite<5>, kFewPasses, {100'000});
  add("save lists of 5", "sqlite backup", save_many_sqlite_backup<5>, kFewPasses, {100'000});
  add("save lists of 5", "limit: write", save_many_limit<5>, kFewPasses, {100'000});
  add("save lists of 50", "tevpf", save_many_ours<50>, kFewPasses, {10'000});
  add("save lists of 50", "sqlite", save_many_sqlite<50>, kFewPasses, {10'000});
  add("save lists of 50", "sqlite backup", save_many_sqlite_backup<50>, kFewPasses, {10'000});
  add("save lists of 50", "limit: write", save_many_limit<50>, kFewPasses, {10'000});
  return 0;
}();

}  // namespace
