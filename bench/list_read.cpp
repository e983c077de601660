// Looking up, changing and walking the parameters of a list.
#include <cstring>
#include <map>

#include "fresh_process.h"
#include "param_lists.h"

namespace {

using namespace bench;

void look_up_ours(benchmark::State& state) {
  OpenFile file;
  const std::vector<std::string> all = names(state.range(0));
  fill_list("list", all);
  const std::vector<std::int32_t> order = shuffled(state.range(0));
  char value[64];
  for (auto _ : state) {
    const Timer timer;
    for (const std::int32_t i : order)
      MUST(TEV8R1_PF_get_param_value("list", all[i].c_str(), value));
    timer.stop(state, state.range(0));
  }
}

void look_up_sqlite(benchmark::State& state) {
  Database db;
  const std::vector<std::string> all = names(state.range(0));
  fill_database(db, all);
  const std::vector<std::int32_t> order = shuffled(state.range(0));
  Statement find(db, "SELECT value FROM p WHERE list=0 AND name=?");
  for (auto _ : state) {
    double sum = 0;
    const Timer timer;
    db.run("BEGIN");
    for (const std::int32_t i : order) {
      find.text(1, all[i].c_str(), static_cast<int>(all[i].size()));
      if (!find.step()) give_up("look up", i);
      sum += sqlite3_column_double(find.get(), 0);
      find.reset();
    }
    db.run("COMMIT");
    timer.stop(state, state.range(0));
    benchmark::DoNotOptimize(sum);
  }
}

std::map<std::string, TEVPF_PARAM_DEF> filled_map(const std::vector<std::string>& all) {
  std::map<std::string, TEVPF_PARAM_DEF> map;
  for (std::int32_t i = 0; i < std::ssize(all); ++i) map.emplace(all[i], definition(i, all[i]));
  return map;
}

void look_up_map(benchmark::State& state) {
  const std::vector<std::string> all = names(state.range(0));
  const auto map = filled_map(all);
  const std::vector<std::int32_t> order = shuffled(state.range(0));
  for (auto _ : state) {
    std::int64_t sum = 0;
    const Timer timer;
    for (const std::int32_t i : order) sum += map.find(all[i])->second.type;
    timer.stop(state, state.range(0));
    benchmark::DoNotOptimize(sum);
  }
}

void change_ours(benchmark::State& state) {
  OpenFile file;
  const std::vector<std::string> all = names(state.range(0));
  fill_list("list", all);
  const std::vector<std::int32_t> order = shuffled(state.range(0));
  const double number = 2.5;
  const std::int32_t whole = 17;
  const float single = 2.5f;
  const std::int16_t small = 17;
  const void* values[] = {&whole, &single, "stainless", &number, &small};
  for (auto _ : state) {
    const Timer timer;
    for (const std::int32_t i : order)
      MUST(TEV8R1_PF_modify_param("list", all[i].c_str(), values[i % 5]));
    timer.stop(state, state.range(0));
  }
}

void change_sqlite(benchmark::State& state) {
  Database db;
  const std::vector<std::string> all = names(state.range(0));
  fill_database(db, all);
  const std::vector<std::int32_t> order = shuffled(state.range(0));
  Statement change(db, "UPDATE p SET value=? WHERE list=0 AND name=? AND ?1 BETWEEN min AND max");
  for (auto _ : state) {
    const Timer timer;
    db.run("BEGIN");
    for (const std::int32_t i : order) {
      change.real(1, 2.5).text(2, all[i].c_str(), static_cast<int>(all[i].size())).once();
    }
    db.run("COMMIT");
    timer.stop(state, state.range(0));
  }
}

void change_map(benchmark::State& state) {
  const std::vector<std::string> all = names(state.range(0));
  auto map = filled_map(all);
  const std::vector<std::int32_t> order = shuffled(state.range(0));
  for (auto _ : state) {
    const Timer timer;
    for (const std::int32_t i : order) map.find(all[i])->second.part.i32.value = 17;
    timer.stop(state, state.range(0));
    benchmark::ClobberMemory();
  }
}

// Walking a list: one pass of each contestant.
void walk_list() {
  MUST(TEV8R1_PF_reset_param("list"));
  char name[TEVPF_NAME_SIZE], value[64];
  while (TEV8R1_PF_get_next_param("list", name, value) == PF_NORMAL) benchmark::DoNotOptimize(name);
}

class ListOfOurs {
 public:
  explicit ListOfOurs(std::int64_t n) { fill_list("list", names(n)); }
  void walk() { walk_list(); }

 private:
  OpenFile file_;
};

// The same list, as a file brings it: its texts and its parameters lie closer together.
class OpenedList {
 public:
  explicit OpenedList(std::int64_t n) {
    const std::string path = folder().file("list.pf");
    {
      const ListOfOurs list(n);
      MUST(TEV8R1_PF_save(path.c_str()));
    }
    MUST(TEV8R1_PF_open(path.c_str()));
  }
  ~OpenedList() { TEV8R1_PF_close(0); }
  OpenedList(const OpenedList&) = delete;
  OpenedList& operator=(const OpenedList&) = delete;

  void walk() { walk_list(); }
};

class ListInSqlite {
 public:
  explicit ListInSqlite(std::int64_t n) { fill_database(db_, names(n)); }
  void walk() {
    Statement all(db_, "SELECT name, value FROM p");
    char name[TEVPF_NAME_SIZE];
    while (all.step()) {
      std::strcpy(name, reinterpret_cast<const char*>(sqlite3_column_text(all.get(), 0)));
      benchmark::DoNotOptimize(sqlite3_column_double(all.get(), 1));
      benchmark::DoNotOptimize(name);
    }
  }

 private:
  Database db_;
};

class ListAsVector {
 public:
  explicit ListAsVector(std::int64_t n) {
    const std::vector<std::string> every = names(n);
    for (std::int32_t i = 0; i < std::ssize(every); ++i) all_.push_back(definition(i, every[i]));
  }
  void walk() const {
    char name[TEVPF_NAME_SIZE], value[64];
    for (const TEVPF_PARAM_DEF& def : all_) {
      std::strcpy(name, def.name);
      switch (def.type) {
        case PF_TYPE_STRING:
          std::strcpy(value, def.part.str.value);
          break;
        case PF_TYPE_DOUBLE:
          std::memcpy(value, reinterpret_cast<const char*>(&def.part) + 4, 8);
          break;
        case PF_TYPE_SHORT:
          std::memcpy(value, &def.part, 2);
          break;
        default:
          std::memcpy(value, &def.part, 4);
          break;
      }
      benchmark::DoNotOptimize(name);
      benchmark::DoNotOptimize(value);
    }
  }

 private:
  std::vector<TEVPF_PARAM_DEF> all_;
};

template <class List>
void walk(benchmark::State& state) {
  List list(state.range(0));
  for (auto _ : state) {
    const Timer timer;
    list.walk();
    timer.stop(state, state.range(0));
  }
}

template <class List>
Measured walk_fresh(std::int64_t n) {
  List list(n);
  const Timer timer;
  for (std::int64_t pass = 0; pass < kFewPasses; ++pass) list.walk();
  return {timer.seconds(), static_cast<double>(kFewPasses * n)};
}

const int registered = [] {
  add("list look up", "tevpf", look_up_ours);
  add("list look up", "sqlite", look_up_sqlite);
  add("list look up", "limit: std map", look_up_map);
  add("list change", "tevpf", change_ours);
  add("list change", "sqlite", change_sqlite);
  add("list change", "limit: std map", change_map);
  add("list walk", "tevpf", walk<ListOfOurs>, kFewPasses);
  add("list walk", "sqlite", walk<ListInSqlite>, kFewPasses);
  add("list walk", "limit: vector", walk<ListAsVector>, kFewPasses);
  add("list walk after opening", "tevpf", walk<OpenedList>, kFewPasses);
  add("list walk after opening", "sqlite", walk<ListInSqlite>, kFewPasses);
  add("list walk after opening", "limit: vector", walk<ListAsVector>, kFewPasses);
  add_fresh("list walk in a fresh process", "tevpf", walk_fresh<ListOfOurs>);
  add_fresh("list walk in a fresh process", "sqlite", walk_fresh<ListInSqlite>);
  add_fresh("list walk in a fresh process", "limit: vector", walk_fresh<ListAsVector>);
  return 0;
}();

}  // namespace
