// Adding, removing and moving parameters of a list whose order is not that of their names.
#include "param_lists.h"

namespace {

using namespace bench;

// An open file with a list of these parameters in this order. Adding them costs too much to be done
// each time: they are added once and saved, and the file is opened.
class UnorderedList {
 public:
  explicit UnorderedList(std::span<const std::string> all) {
    const std::string name = "unordered_" + std::to_string(all.size()) + ".pf";
    path_ = folder().file(name.c_str());
    if (!std::filesystem::exists(path_)) {
      const OpenFile file;
      MUST(TEV8R1_PF_create_elem("list", "", PF_ELEM_LIST));
      for (std::size_t i = 0; i < all.size(); ++i)
        add_to_list("list", static_cast<std::int32_t>(i), all[i]);
      MUST(TEV8R1_PF_save(path_.c_str()));
    }
    MUST(TEV8R1_PF_open(path_.c_str()));
  }
  ~UnorderedList() { TEV8R1_PF_close(0); }
  UnorderedList(const UnorderedList&) = delete;
  UnorderedList& operator=(const UnorderedList&) = delete;

 private:
  std::string path_;
};

void add_ours(benchmark::State& state) {
  const std::vector<std::string> all = names(state.range(0));
  const auto start = static_cast<std::size_t>(already_there(state.range(0)));
  for (auto _ : state) {
    const UnorderedList list({all.data(), start});
    const Timer timer;
    for (std::size_t i = start; i < all.size(); ++i)
      add_to_list("list", static_cast<std::int32_t>(i), all[i]);
    timer.stop(state, static_cast<std::int64_t>(all.size() - start));
  }
}

void add_sqlite(benchmark::State& state) {
  const std::vector<std::string> all = names(state.range(0));
  const auto start = static_cast<std::size_t>(already_there(state.range(0)));
  for (auto _ : state) {
    Database db;
    fill_database(db, {all.data(), start});
    const Timer timer;
    db.run("BEGIN");
    Statement into(db, kInsertParam);
    for (std::size_t i = start; i < all.size(); ++i)
      insert(into, 0, static_cast<std::int32_t>(i), all[i]);
    db.run("COMMIT");
    timer.stop(state, static_cast<std::int64_t>(all.size() - start));
  }
}

void remove_ours(benchmark::State& state) {
  const std::vector<std::string> all = names(state.range(0));
  const std::vector<std::int32_t> which = some_of(state.range(0), changes(state.range(0)));
  for (auto _ : state) {
    const UnorderedList list(all);
    const Timer timer;
    for (const std::int32_t i : which) MUST(TEV8R1_PF_delete_param("list", all[i].c_str()));
    timer.stop(state, std::ssize(which));
  }
}

void remove_sqlite(benchmark::State& state) {
  const std::vector<std::string> all = names(state.range(0));
  const std::vector<std::int32_t> which = some_of(state.range(0), changes(state.range(0)));
  for (auto _ : state) {
    Database db;
    fill_database(db, all);
    Statement erase(db, "DELETE FROM p WHERE list=0 AND name=?");
    const Timer timer;
    db.run("BEGIN");
    for (const std::int32_t i : which)
      erase.text(1, all[i].c_str(), static_cast<int>(all[i].size())).once();
    db.run("COMMIT");
    timer.stop(state, std::ssize(which));
  }
}

void add_in_front_ours(benchmark::State& state) {
  const std::int64_t count = moves(state.range(0));
  const std::vector<std::string> all = names(state.range(0) + count);
  const auto start = static_cast<std::size_t>(state.range(0));
  const std::vector<std::int32_t> places = random_numbers(count, state.range(0));
  for (auto _ : state) {
    const UnorderedList list({all.data(), start});
    const Timer timer;
    for (std::size_t i = start; i < all.size(); ++i)
      add_to_list("list", static_cast<std::int32_t>(i), all[i], places[i - start]);
    timer.stop(state, count);
  }
}

void move_ours(benchmark::State& state) {
  const std::int64_t count = moves(state.range(0));
  const std::vector<std::string> all = names(state.range(0));
  const std::vector<std::int32_t> which = some_of(state.range(0), count);
  const std::vector<std::int32_t> places = random_numbers(count, state.range(0));
  for (auto _ : state) {
    const UnorderedList list(all);
    const Timer timer;
    for (std::size_t i = 0; i < which.size(); ++i)
      MUST(TEV8R1_PF_move_param("list", all[which[i]].c_str(), places[i]));
    timer.stop(state, count);
  }
}

const int registered = [] {
  add("list add", "tevpf", add_ours);
  add("list add", "sqlite", add_sqlite);
  add("list remove", "tevpf", remove_ours);
  add("list remove", "sqlite", remove_sqlite);
  add("list add at a position", "tevpf", add_in_front_ours);
  add("list move a parameter", "tevpf", move_ours);
  return 0;
}();

}  // namespace
