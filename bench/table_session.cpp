// What a program does with a table between opening and saving it: finding, reading on, appending,
// replacing and deleting rows in random turns, from the first operation after opening on.
#include "parts_table.h"

namespace {

using namespace bench;

constexpr std::int64_t kOperations = 20'000;
constexpr int kRowsReadOn = 10;

enum class Action { kFind, kReadOn, kAppend, kReplace, kDelete };

struct Operation {
  Action action;
  Row row;  // the row to append; of others the id, and the new group to replace with
};

// The same operations for both contestants: every id that is looked for is there.
std::vector<Operation> session(std::int64_t n) {
  std::vector<std::int32_t> ids;
  for (const Row& r : rows_of(n, kSpread, NewIds::kGap)) ids.push_back(r.id);
  NewIds new_ids(n);
  std::mt19937 random(kSeed);
  std::discrete_distribution<int> action({25, 25, 20, 15, 15});
  std::uniform_int_distribution<std::int32_t> group(0, kSpread - 1);
  std::vector<Operation> all;
  for (std::int64_t i = 0; i < kOperations; ++i) {
    const auto next = static_cast<Action>(action(random));
    if (next == Action::kAppend) {
      ids.push_back(new_ids.next());
      all.push_back({next, row(ids.back())});
      continue;
    }
    std::int32_t& id = ids[std::uniform_int_distribution<std::size_t>(0, ids.size() - 1)(random)];
    all.push_back({next, row(id)});
    all.back().row.group = group(random);
    if (next != Action::kDelete) continue;
    id = ids.back();
    ids.pop_back();
  }
  return all;
}

void perform(const Operation& operation) {
  Row r;
  switch (operation.action) {
    case Action::kFind:
      find_id(operation.row.id, r);
      break;
    case Action::kReadOn:
      for (int i = 0; i < kRowsReadOn; ++i) {
        if (TEV8R1_PF_get_next_row("parts", &r) != PF_NORMAL) break;
        benchmark::DoNotOptimize(r);
      }
      break;
    case Action::kAppend:
      MUST(TEV8R1_PF_add_row("parts", &operation.row));
      break;
    case Action::kReplace:
      find_id(operation.row.id, r);
      r.group = operation.row.group;
      MUST(TEV8R1_PF_replace_row("parts", &r));
      break;
    case Action::kDelete:
      find_id(operation.row.id, r);
      MUST(TEV8R1_PF_delete_row("parts"));
      break;
  }
}

void session_ours(benchmark::State& state) {
  const std::string path = saved_table(shuffled_rows(state.range(0), NewIds::kGap));
  const std::vector<Operation> operations = session(state.range(0));
  warm_memory();
  for (auto _ : state) {
    MUST(TEV8R1_PF_open(path.c_str()));
    const Timer timer;
    MUST(TEV8R1_PF_define_table_search("parts", "id"));
    for (const Operation& operation : operations) perform(operation);
    timer.stop(state, kOperations);
    MUST(TEV8R1_PF_close(0));
  }
}

class SqliteSession {
 public:
  explicit SqliteSession(const Database& db)
      : into_(db, kInsert),
        find_(db, kFind),
        change_(db, kReplace),
        erase_(db, kDelete),
        read_on_(db, "SELECT * FROM parts WHERE id>? ORDER BY id LIMIT ?") {}

  void perform(const Operation& operation) {
    Row r;
    const std::int32_t id = operation.row.id;
    switch (operation.action) {
      case Action::kFind:
        find_id(find_, id, r);
        break;
      case Action::kReadOn:
        read_on_.integer(1, last_).integer(2, kRowsReadOn);
        while (read_on_.step()) {
          read_row(read_on_, r);
          benchmark::DoNotOptimize(r);
          last_ = r.id;
        }
        read_on_.reset();
        return;
      case Action::kAppend:
        insert(into_, operation.row);
        return;
      case Action::kReplace:
        change_.integer(1, operation.row.group).integer(2, id).once();
        break;
      case Action::kDelete:
        erase_.integer(1, id).once();
        break;
    }
    last_ = id;
  }

 private:
  Statement into_, find_, change_, erase_, read_on_;
  std::int32_t last_ = -1;  // the id behind which reading goes on
};

void session_sqlite(benchmark::State& state) {
  const std::vector<Row> rows = shuffled_rows(state.range(0), NewIds::kGap);
  const std::vector<Operation> operations = session(state.range(0));
  warm_memory();
  for (auto _ : state) {
    Database db;
    fill_sqlite(db, rows);
    SqliteSession session(db);
    const Timer timer;
    db.run("BEGIN");
    for (const Operation& operation : operations) session.perform(operation);
    db.run("COMMIT");
    timer.stop(state, kOperations);
  }
}

const int registered = [] {
  add("table session after opening", "tevpf", session_ours, kFewPasses);
  add("table session after opening", "sqlite", session_sqlite);
  return 0;
}();

}  // namespace
