// The table of the table workloads, ours and SQLite's, and the rows that go into it.
//
// Columns: id (int32, indexed, unique), name (string[20]), measure (double), class (int16),
// group (int32, indexed). SQLite keeps its rows in the order of the id, which is its fastest index.
#pragma once

#include "common.h"

namespace bench {

struct Row {  // as the library lays the columns out
  std::int32_t id;
  char name[21];
  char gap[7];
  double measure;
  std::int16_t kind;
  std::int16_t gap2;
  std::int32_t group;
};
static_assert(sizeof(Row) == 48);

inline constexpr std::int32_t kSpread = 1'000'000'000;  // group values that hardly ever meet
inline constexpr std::int32_t kFewGroups = 10;

// The row of an id: everything but the id is random and follows from it.
Row row(std::int32_t id, std::int32_t groups = kSpread);

// Rows with the ids 0, gap, 2 * gap ..., in that order or shuffled.
std::vector<Row> rows_of(std::int64_t n, std::int32_t groups = kSpread, std::int32_t gap = 1);
std::vector<Row> shuffled_rows(std::int64_t n, std::int32_t gap = 1);

// Random ids that no row has, in a table of n rows whose ids lie kGap apart.
class NewIds {
 public:
  static constexpr std::int32_t kGap = 32;

  explicit NewIds(std::int64_t n);
  std::int32_t next();

 private:
  std::vector<std::int32_t> used_;  // in each gap
  std::mt19937 random_{kSeed + 1};
};

// ---- Ours: the table "parts" of the current file ----

void define_table();

// Defines the table with these rows. The indexes are built at the end, which is the cheap way.
void fill_table(std::span<const Row> all);

// Makes the row of that id the current one; the search column must be the id.
inline void find_id(std::int32_t id, Row& r) {
  MUST(TEV8R1_PF_reset_table("parts"));
  MUST(TEV8R1_PF_get_row_by_value("parts", 0, "id", &id, &r));
}

// Saves a table of these rows and closes it again; the path of the file.
std::string saved_table(std::span<const Row> all);

// ---- SQLite's: the table parts of a database ----

inline constexpr char kInsert[] = "INSERT INTO parts VALUES(?,?,?,?,?)";
inline constexpr char kFind[] = "SELECT * FROM parts WHERE id=?";
inline constexpr char kReplace[] = "UPDATE parts SET grp=? WHERE id=?";
inline constexpr char kDelete[] = "DELETE FROM parts WHERE id=?";

void insert(Statement& into, const Row& r);
void fill_sqlite(Database& db, std::span<const Row> all);
void read_row(const Statement& from, Row& r);
void find_id(Statement& find, std::int32_t id, Row& r);
void read_all_sqlite(const Database& db, const char* sql);

}  // namespace bench
