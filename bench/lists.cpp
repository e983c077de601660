// Lists against SQLite and, where there is one, against a limit: the plain thing without a library.
#include <cstring>
#include <fstream>
#include <map>
#include <nlohmann/json.hpp>

#include "common.h"

namespace {

using namespace bench;

std::string name_of(std::int32_t i) {
  char name[TEVPF_NAME_SIZE];
  std::snprintf(name, sizeof name, "param_%08x", static_cast<unsigned>(i) * 2654435761u);
  return name;
}

std::vector<std::string> names(std::int64_t n) {
  std::vector<std::string> result;
  for (std::int32_t i = 0; i < n; ++i) result.push_back(name_of(i));
  return result;
}

// Parameter i: the five types in turn, every second one with a description.
TEVPF_PARAM_DEF definition(std::int32_t i, const std::string& name) {
  static char description[] = "measured at room temperature";
  static char text[] = "stainless steel";
  TEVPF_PARAM_DEF def{};
  def.type = PF_TYPE_INT + i % 5;
  std::strcpy(def.name, name.c_str());
  std::strcpy(def.units, "mm");
  def.description = i % 2 == 0 ? description : nullptr;
  switch (def.type) {
    case PF_TYPE_INT:
      def.part.i32 = {i, 2'000'000'000, -2'000'000'000};
      break;
    case PF_TYPE_REAL:
      def.part.f32 = {6, 1.5f, 1e6f, -1e6f};
      break;
    case PF_TYPE_STRING:
      def.part.str.value = text;
      break;
    case PF_TYPE_DOUBLE:
      def.part.f64 = {12, i * 0.125, 1e12, -1e12};
      break;
    default:
      def.part.i16 = {static_cast<std::int16_t>(i % 1000), 32000, -32000};
      break;
  }
  return def;
}

void add_to_list(const char* list, std::int32_t i, const std::string& name) {
  const TEVPF_PARAM_DEF def = definition(i, name);
  MUST(TEV8R1_PF_add_param(list, &def, PF_END_POS));
}

// A list of n parameters, filled in name order, which is the cheap way.
void fill_list(const char* list, const std::vector<std::string>& all) {
  MUST(TEV8R1_PF_create_elem(list, "", PF_ELEM_LIST));
  std::vector<std::int32_t> order(all.size());
  std::iota(order.begin(), order.end(), 0);
  std::sort(order.begin(), order.end(),
            [&](std::int32_t a, std::int32_t b) { return all[a] < all[b]; });
  for (const std::int32_t i : order) add_to_list(list, i, all[i]);
}

constexpr char kCreate[] =
    "CREATE TABLE p(list INTEGER, name TEXT, type INTEGER, units TEXT, description TEXT,"
    " value, max, min, prec INTEGER, PRIMARY KEY(list, name)) WITHOUT ROWID";
constexpr char kInsert[] = "INSERT INTO p VALUES(?,?,?,?,?,?,?,?,?)";

void insert(Statement& into, std::int64_t list, std::int32_t i, const std::string& name) {
  into.integer(1, list).text(2, name.c_str()).integer(3, PF_TYPE_INT + i % 5).text(4, "mm");
  if (i % 2 == 0) {
    into.text(5, "measured at room temperature");
  } else {
    sqlite3_bind_null(into.get(), 5);
  }
  if (i % 5 == 2) {
    into.text(6, "stainless steel");
  } else {
    into.real(6, i * 0.125);
  }
  into.real(7, 1e12).real(8, -1e12).integer(9, 12);
  into.once();
}

void fill_database(Database& db, const std::vector<std::string>& all, std::int64_t lists = 1) {
  db.run(kCreate);
  db.run("BEGIN");
  Statement into(db, kInsert);
  for (std::int64_t list = 0; list < lists; ++list) {
    for (std::int32_t i = 0; i < std::ssize(all); ++i) insert(into, list, i, all[i]);
  }
  db.run("COMMIT");
}

std::int64_t read_everything(const Database& db) {
  Statement all(db, "SELECT * FROM p");
  std::int64_t sum = 0;
  while (all.step()) {
    for (int c = 0; c < 5; ++c) {
      if (const auto* text = sqlite3_column_text(all.get(), c)) sum += text[0];
    }
    for (int c = 5; c < 9; ++c)
      sum += static_cast<std::int64_t>(sqlite3_column_double(all.get(), c));
  }
  return sum;
}

// Adding: all of them up to 100,000, beyond that the last thousand.
std::size_t already_there(std::int64_t n) {
  return n > kManyRows ? static_cast<std::size_t>(n - kFewOperations) : 0;
}

void add_ours(benchmark::State& state) {
  const std::vector<std::string> all = names(state.range(0));
  const std::size_t start = already_there(state.range(0));
  for (auto _ : state) {
    OpenFile file;
    fill_list("list", {all.begin(), all.begin() + static_cast<std::ptrdiff_t>(start)});
    const Timer timer;
    for (std::size_t i = start; i < all.size(); ++i)
      add_to_list("list", static_cast<std::int32_t>(i), all[i]);
    timer.stop(state, static_cast<std::int64_t>(all.size() - start));
  }
}

void add_sqlite(benchmark::State& state) {
  const std::vector<std::string> all = names(state.range(0));
  const std::size_t start = already_there(state.range(0));
  for (auto _ : state) {
    Database db;
    fill_database(db, {all.begin(), all.begin() + static_cast<std::ptrdiff_t>(start)});
    const Timer timer;
    db.run("BEGIN");
    Statement into(db, kInsert);
    for (std::size_t i = start; i < all.size(); ++i)
      insert(into, 0, static_cast<std::int32_t>(i), all[i]);
    db.run("COMMIT");
    timer.stop(state, static_cast<std::int64_t>(all.size() - start));
  }
}

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

void walk_ours(benchmark::State& state) {
  OpenFile file;
  fill_list("list", names(state.range(0)));
  char name[TEVPF_NAME_SIZE], value[64];
  for (auto _ : state) {
    MUST(TEV8R1_PF_reset_param("list"));
    const Timer timer;
    while (TEV8R1_PF_get_next_param("list", name, value) == PF_NORMAL)
      benchmark::DoNotOptimize(name);
    timer.stop(state, state.range(0));
  }
}

void walk_sqlite(benchmark::State& state) {
  Database db;
  fill_database(db, names(state.range(0)));
  Statement all(db, "SELECT name, value FROM p");
  char name[TEVPF_NAME_SIZE];
  for (auto _ : state) {
    const Timer timer;
    while (all.step()) {
      std::strcpy(name, reinterpret_cast<const char*>(sqlite3_column_text(all.get(), 0)));
      benchmark::DoNotOptimize(sqlite3_column_double(all.get(), 1));
      benchmark::DoNotOptimize(name);
    }
    all.reset();
    timer.stop(state, state.range(0));
  }
}

void walk_vector(benchmark::State& state) {
  std::vector<TEVPF_PARAM_DEF> all;
  const std::vector<std::string> every = names(state.range(0));
  for (std::int32_t i = 0; i < std::ssize(every); ++i) all.push_back(definition(i, every[i]));
  char name[TEVPF_NAME_SIZE], value[64];
  for (auto _ : state) {
    const Timer timer;
    for (const TEVPF_PARAM_DEF& def : all) {
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
    timer.stop(state, state.range(0));
  }
}

void save_ours(benchmark::State& state) {
  OpenFile file;
  fill_list("list", names(state.range(0)));
  time_save(state, state.range(0));
}

void save_sqlite(benchmark::State& state) {
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
  time_backup(state, db, state.range(0));
}

template <int Params>
void save_many_limit(benchmark::State& state) {
  time_write(state, saved_lists(state.range(0), Params), state.range(0));
}

const int registered = [] {
  add("list add", "tevpf", add_ours);
  add("list add", "sqlite", add_sqlite);
  add("list look up", "tevpf", look_up_ours);
  add("list look up", "sqlite", look_up_sqlite);
  add("list look up", "limit: std map", look_up_map);
  add("list change", "tevpf", change_ours);
  add("list change", "sqlite", change_sqlite);
  add("list change", "limit: std map", change_map);
  add("list walk", "tevpf", walk_ours, kFewPasses);
  add("list walk", "sqlite", walk_sqlite, kFewPasses);
  add("list walk", "limit: vector", walk_vector, kFewPasses);
  add("list save", "tevpf", save_ours, kFewPasses);
  add("list save", "sqlite", save_sqlite, kFewPasses);
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
  add("save lists of 5", "limit: write", save_many_limit<5>, kFewPasses, {100'000});
  add("save lists of 50", "tevpf", save_many_ours<50>, kFewPasses, {10'000});
  add("save lists of 50", "sqlite", save_many_sqlite<50>, kFewPasses, {10'000});
  add("save lists of 50", "limit: write", save_many_limit<50>, kFewPasses, {10'000});
  return 0;
}();

}  // namespace
