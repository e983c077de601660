// What the benchmarks share: fixed seeds, checked calls, temporary files, a thin SQLite handle.
#pragma once

#include <benchmark/benchmark.h>
#include <sqlite3.h>
#include <tevpf.h>

#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <numeric>
#include <random>
#include <span>
#include <string>
#include <vector>

namespace bench {

inline constexpr std::uint32_t kSeed = 20240229;

// What changes a table or list of n is timed over so many operations at most, spread at random over
// all of it. Beyond kManyRows, adding is the last of them, to what was there before.
inline constexpr std::int64_t kManyRows = 100'000;
inline constexpr std::int64_t kFewOperations = 10'000;
// The same for what costs milliseconds where each operation moves everything behind it.
inline constexpr std::int64_t kFewMoves = 1'000;

constexpr std::int64_t already_there(std::int64_t n) {
  return n > kManyRows ? n - kFewOperations : 0;
}
constexpr std::int64_t changes(std::int64_t n) { return std::min(n / 2, kFewOperations); }
constexpr std::int64_t moves(std::int64_t n) { return std::min(n / 2, kFewMoves); }

// So many random accesses are enough to time one that costs the same from the first on.
inline constexpr std::int64_t kManyAccesses = 1'000'000;

[[noreturn]] inline void give_up(const char* what, long code) {
  std::fprintf(stderr, "%s failed: 0x%lx\n", what, static_cast<unsigned long>(code));
  std::abort();
}

#define MUST(call)                                                                    \
  do {                                                                                \
    if (const TEVPF_STATUS must_ = (call); must_ != PF_NORMAL && must_ != PF_NEWFILE) \
      ::bench::give_up(#call, static_cast<long>(must_));                              \
  } while (0)

// Scrambles a number: always the same for the same number, and never the same for two of them.
constexpr std::uint32_t scrambled(std::uint32_t x) {
  x = (x ^ (x >> 16)) * 0x85EBCA6Bu;
  x = (x ^ (x >> 13)) * 0xC2B2AE35u;
  return x ^ (x >> 16);
}

inline std::vector<std::int32_t> shuffled(std::int64_t n) {
  std::vector<std::int32_t> order(static_cast<std::size_t>(n));
  std::iota(order.begin(), order.end(), 0);
  std::shuffle(order.begin(), order.end(), std::mt19937(kSeed));
  return order;
}

// The first `count` of the numbers 0..n-1 in random order.
inline std::vector<std::int32_t> some_of(std::int64_t n, std::int64_t count) {
  std::vector<std::int32_t> order = shuffled(n);
  order.resize(static_cast<std::size_t>(std::min(n, count)));
  return order;
}

// So many random numbers from 0 to below - 1.
inline std::vector<std::int32_t> random_numbers(std::int64_t count, std::int64_t below) {
  std::mt19937 random(kSeed);
  std::uniform_int_distribution<std::int32_t> any(0, static_cast<std::int32_t>(below - 1));
  std::vector<std::int32_t> numbers(static_cast<std::size_t>(count));
  std::generate(numbers.begin(), numbers.end(), [&] { return any(random); });
  return numbers;
}

// Paths in a folder of this process, which goes when the program ends.
class Folder {
 public:
  Folder() {
    std::string path = (std::filesystem::temp_directory_path() / "tevpf_bench.XXXXXX").string();
    if (mkdtemp(path.data()) == nullptr) give_up("mkdtemp", 0);
    path_ = path;
  }
  ~Folder() { std::filesystem::remove_all(path_); }
  std::string file(const char* name) const { return (path_ / name).string(); }

 private:
  std::filesystem::path path_;
};

inline const Folder& folder() {
  static const Folder instance;
  return instance;
}

// A fresh open file without elements, closed and forgotten at the end of the scope.
class OpenFile {
 public:
  explicit OpenFile(const char* name = "work.pf") : path_(folder().file(name)) {
    std::filesystem::remove(path_);
    TEV8R1_PF_init();
    MUST(TEV8R1_PF_open(path_.c_str()));
  }
  ~OpenFile() {
    TEV8R1_PF_change_file(path_.c_str());
    TEV8R1_PF_close(0);
  }
  OpenFile(const OpenFile&) = delete;
  OpenFile& operator=(const OpenFile&) = delete;

 private:
  std::string path_;
};

enum class Settings { kFastest, kDefault };

class Database {
 public:
  explicit Database(const std::string& path = ":memory:", Settings settings = Settings::kFastest) {
    if (sqlite3_open(path.c_str(), &db_) != SQLITE_OK) give_up("sqlite3_open", 0);
    if (settings == Settings::kDefault) return;
    run("PRAGMA journal_mode=OFF");
    run("PRAGMA synchronous=OFF");
    run("PRAGMA locking_mode=EXCLUSIVE");
    run("PRAGMA cache_size=-1000000");
  }
  ~Database() { sqlite3_close_v2(db_); }
  Database(const Database&) = delete;
  Database& operator=(const Database&) = delete;

  void run(const char* sql) {
    if (sqlite3_exec(db_, sql, nullptr, nullptr, nullptr) != SQLITE_OK) give_up(sql, 0);
  }
  sqlite3* get() const { return db_; }

 private:
  sqlite3* db_ = nullptr;
};

class Statement {
 public:
  Statement(const Database& db, const char* sql) {
    if (sqlite3_prepare_v3(db.get(), sql, -1, SQLITE_PREPARE_PERSISTENT, &stmt_, nullptr) !=
        SQLITE_OK)
      give_up(sql, 0);
  }
  ~Statement() { sqlite3_finalize(stmt_); }
  Statement(const Statement&) = delete;
  Statement& operator=(const Statement&) = delete;

  Statement& text(int at, const char* value, int length = -1) {
    sqlite3_bind_text(stmt_, at, value, length, SQLITE_STATIC);
    return *this;
  }
  Statement& integer(int at, std::int64_t value) {
    sqlite3_bind_int64(stmt_, at, value);
    return *this;
  }
  Statement& real(int at, double value) {
    sqlite3_bind_double(stmt_, at, value);
    return *this;
  }
  bool step() { return sqlite3_step(stmt_) == SQLITE_ROW; }
  void once() {
    const int code = sqlite3_step(stmt_);
    if (code != SQLITE_DONE && code != SQLITE_ROW) give_up("sqlite3_step", code);
    sqlite3_reset(stmt_);
  }
  void reset() { sqlite3_reset(stmt_); }
  sqlite3_stmt* get() const { return stmt_; }

 private:
  sqlite3_stmt* stmt_ = nullptr;
};

inline void backup(const Database& from, const Database& to) {
  sqlite3_backup* job = sqlite3_backup_init(to.get(), "main", from.get(), "main");
  if (job == nullptr || sqlite3_backup_step(job, -1) != SQLITE_DONE) give_up("sqlite3_backup", 0);
  sqlite3_backup_finish(job);
}

// One write() of some bytes, without anything else; all the bytes of a file.
void write_plainly(const std::string& path, std::span<const char> bytes);
void write_and_sync(const std::string& path, std::span<const char> bytes);
std::vector<char> contents(const std::string& path);

// To be called ahead of passes that take much fresh memory, in the program or as cached files: has the
// host of a virtual machine provide it. That takes milliseconds for 2 MB, in no order, and would be part
// of some figures; a few seconds after memory was given back the host may have taken it again.
void warm_memory();

// Whole files, timed: saving what is open into a new one, and opening one; SQLite's two ways of
// saving a database from memory, page by page and as one image; and the limits, one write() or read()
// of the same bytes. `operations` is what the time is divided by.
void time_save(benchmark::State& state, std::int64_t operations);
void time_backup(benchmark::State& state, const Database& from, std::int64_t operations);
void time_serialize(benchmark::State& state, const Database& from, std::int64_t operations);
void time_write(benchmark::State& state, const std::string& source, std::int64_t operations);
void time_open(benchmark::State& state, const std::string& path, std::int64_t operations);
void time_read(benchmark::State& state, const std::string& path, std::int64_t operations);

// Registers a benchmark under workload/contestant/n; its figure is time per operation. Sizes that take
// long to set up get a fixed number of passes a run.
inline constexpr std::int64_t kLongSetUp = 20'000;  // entries from which on it does
inline constexpr std::int64_t kFewPasses = 5;       // of what one set-up serves
inline constexpr std::int64_t kManyPasses = 50;     // of a few milliseconds each
inline const std::vector<std::int64_t> kSizes = {1'000, 10'000, 100'000, 1'000'000};

inline void add(const char* workload, const char* contestant, void (*body)(benchmark::State&),
                std::int64_t passes = 1, const std::vector<std::int64_t>& sizes = kSizes) {
  const std::string name = std::string(workload) + "/" + contestant;
  for (const std::int64_t n : sizes) {
    auto* entry = benchmark::RegisterBenchmark(name.c_str(), body)->Arg(n)->UseManualTime();
    if (n >= kLongSetUp) entry->Iterations(passes);
  }
}

// Times one run of a workload over `operations` operations; setting up and cleaning up stay outside.
// What counts is the processor's time in this thread, in the kernel too, so that a machine shared with
// others measures alike; where the disk is waited for, it is the time on the wall.
class Timer {
 public:
  enum class Clock : clockid_t { kProcessor = CLOCK_THREAD_CPUTIME_ID, kWall = CLOCK_MONOTONIC };

  explicit Timer(Clock clock = Clock::kProcessor) : clock_(clock), start_(now()) {}
  double seconds() const { return now() - start_; }
  // Ends a pass. All passes of a run must be of as many operations.
  void stop(benchmark::State& state, std::int64_t operations) const {
    record(state, seconds(), operations);
  }
  static void record(benchmark::State& state, double seconds, std::int64_t operations) {
    state.SetIterationTime(seconds);
    state.counters["operations"] = static_cast<double>(operations);
  }

 private:
  double now() const {
    timespec t;
    clock_gettime(static_cast<clockid_t>(clock_), &t);
    return static_cast<double>(t.tv_sec) + 1e-9 * static_cast<double>(t.tv_nsec);
  }
  Clock clock_;
  double start_;
};

}  // namespace bench
