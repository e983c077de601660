// SQL on a table of a parameter file, and on the same rows in SQLite's own memory.
// Usage: sql_bench [ROWS]. Prints a line for each query, in microseconds.
#include <algorithm>
#include <chrono>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <random>
#include <string>
#include <tevpf.hpp>

#include "sql/database.h"

namespace {

using Clock = std::chrono::steady_clock;

double microseconds(Clock::time_point since) {
  return std::chrono::duration<double, std::micro>(Clock::now() - since).count();
}

void fill(tevpf::Table table, int rows) {
  using tevpf::Column;
  using tevpf::Type;
  table.add_column(Column("id", Type::int32).unique());
  table.add_column(Column("mass", Type::float64).precision(9).indexed());
  table.add_column(Column("grade", Type::int16));
  table.add_column(Column("name", Type::string).width(12).indexed());
  std::mt19937 random(1);
  for (int i = 0; i < rows; ++i) {
    const auto number = static_cast<std::int32_t>(random() % 1000000007U);
    table.append({i, number * 1e-3, number % 1000, "part" + std::to_string(number % 10000000)});
  }
}

class Bench {
 public:
  explicit Bench(int rows) : rows_(rows), file_(tevpf::File::create(path_)) {
    fill(file_.create_table("t"), rows);
    file_.save();
    file_.close();
    const auto start = Clock::now();
    file_ = tevpf::File::open(path_);
    database_.attach(file_);
    std::printf("%-34s %12.0f\n", "open and attach", microseconds(start));
    run("ATTACH ':memory:' AS m");
    run("CREATE TABLE m.t(id INTEGER, mass REAL, grade INTEGER, name TEXT)");
    run("INSERT INTO m.t SELECT * FROM main.t");
    run("CREATE UNIQUE INDEX m.by_id ON t(id)");
    run("CREATE INDEX m.by_mass ON t(mass)");
    run("CREATE INDEX m.by_name ON t(name)");
  }
  ~Bench() { std::filesystem::remove(path_); }
  Bench(const Bench&) = delete;
  Bench& operator=(const Bench&) = delete;

  // A query of `pattern`, with the table's name in place of "@", by a random id or mass.
  void points(const char* name, const std::string& pattern, double scale) {
    measure(name, pattern, [&](sql::Statement statement) {
      const int queries = 100000;
      std::mt19937 random(2);
      const auto start = Clock::now();
      for (int i = 0; i < queries; ++i) {
        statement.bind(1, static_cast<double>(random() % static_cast<unsigned>(rows_)) * scale);
        while (statement.step()) {
        }
        statement.reset();
      }
      return microseconds(start) / queries;
    });
  }

  void whole(const char* name, const std::string& pattern, int times = 5) {
    measure(name, pattern, [&](sql::Statement statement) {
      double best = 1e18;
      for (int i = 0; i < times; ++i) {
        const auto start = Clock::now();
        std::int64_t sum = 0;
        while (statement.step()) {
          for (int c = 0; c < statement.columns(); ++c) sum += statement.integer(c);
        }
        best = std::min(best, microseconds(start));
        statement.reset();
        if (sum == 42) std::puts("");
      }
      return best;
    });
  }

 private:
  void run(const std::string& text) { database_.prepare_one(text).step(); }

  template <class Time>
  void measure(const char* name, const std::string& pattern, Time time) {
    double result[2];
    for (const int side : {0, 1}) {
      std::string text = pattern;
      text.replace(text.find('@'), 1, side == 0 ? "main.t" : "m.t");
      result[side] = time(database_.prepare_one(text));
    }
    std::printf("%-34s %12.2f %12.2f  %5.2f\n", name, result[0], result[1], result[0] / result[1]);
  }

  const std::string path_ = (std::filesystem::temp_directory_path() / "sql_bench.pf").string();
  int rows_;
  tevpf::File file_;
  sql::Database database_;
};

}  // namespace

int main(int argc, char** argv) {
  Bench bench(argc > 1 ? std::atoi(argv[1]) : 1000000);
  std::printf("%-34s %12s %12s  %s\n", "microseconds", "file", "SQLite", "ratio");
  bench.whole("first use of the index of id", "SELECT grade FROM @ WHERE id = 5", 1);
  bench.whole("first use of the index of mass", "SELECT grade FROM @ WHERE mass = 5", 1);
  bench.points("point query, integer", "SELECT grade FROM @ WHERE id = ?", 1);
  bench.points("point query, double", "SELECT grade FROM @ WHERE mass = ?", 1e-3);
  bench.points("by rowid", "SELECT grade FROM @ WHERE rowid = ?", 1);
  bench.whole("prefix of 5 characters", "SELECT count(*) FROM @ WHERE name GLOB 'part1*'");
  bench.whole("range of 1 %", "SELECT sum(grade) FROM @ WHERE mass BETWEEN 5e5 AND 5.1e5");
  bench.whole("first 10 in order", "SELECT id FROM @ ORDER BY mass DESC LIMIT 10");
  bench.whole("all in order", "SELECT sum(id) FROM (SELECT id FROM @ ORDER BY mass LIMIT -1)");
  bench.whole("scan: count", "SELECT count(*) FROM @ WHERE grade = 7");
  bench.whole("scan: two sums", "SELECT sum(grade), sum(mass + 1) FROM @");
  bench.whole("scan: texts", "SELECT sum(grade) FROM @ WHERE name LIKE '%77'");
  bench.whole("scan: texts in SQLite's index", "SELECT count(*) FROM @ WHERE name LIKE '%77'");
  bench.whole("scan: all columns", "SELECT * FROM @");
  bench.whole("update of a tenth, no index", "UPDATE @ SET grade = 1 WHERE id % 10 = 0", 1);
  bench.whole("delete of every other row", "DELETE FROM @ WHERE id % 2 = 0", 1);
}
