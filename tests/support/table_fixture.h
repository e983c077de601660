// Column definitions, and a table "t" in a new file; each look at it checks its invariants.
#pragma once

#include <cstring>
#include <string>
#include <vector>

#include "support/temp_file.h"
#include "tables/column_index.h"
#include "tables/row_store.h"

#define ASSERT_OK(expr) ASSERT_EQ(expr, PF_NORMAL)

namespace tevpf {

inline constexpr std::int32_t kInt = PF_TYPE_INT, kReal = PF_TYPE_REAL, kText = PF_TYPE_STRING,
                              kDouble = PF_TYPE_DOUBLE, kShort = PF_TYPE_SHORT;

struct Bounds {
  double min = -1000, max = 1000;
  std::int32_t precision = 6;
};

inline TEVPF_COL_DEF col(const char* name, std::int32_t type, std::int32_t width = 6,
                         Bounds bounds = {}) {
  TEVPF_COL_DEF def{};
  def.type = type;
  std::strncpy(def.name, name, sizeof def.name - 1);
  def.width = width;
  if (!is_number_type(type)) return def;
  with_number(type, [&](auto tag) {
    using T = decltype(tag);
    limits_of<T>(def).min = static_cast<T>(bounds.min);
    limits_of<T>(def).max = static_cast<T>(bounds.max);
    if constexpr (kIsFloating<T>) limits_of<T>(def).precision = bounds.precision;
  });
  return def;
}

inline TEVPF_COL_DEF indexed(TEVPF_COL_DEF def, bool unique = false) {
  def.idx_flag = 1;
  def.unq_flag = unique;
  return def;
}

inline TEVPF_COL_DEF described(TEVPF_COL_DEF def, const char* text) {
  def.description = const_cast<char*>(text);
  return def;
}

class TableTest : public TempFileTest {
 protected:
  TableTest() { new_table(); }

  // An empty table "t" in place of the one that there is.
  static void new_table() {
    TEV8R1_PF_delete_table("t");
    EXPECT_EQ(TEV8R1_PF_create_elem("t", "", PF_ELEM_TABLE), PF_NORMAL);
    set_error_texts();
  }
  static TEVPF_TABLE& table(const char* name = "t") {
    TEVPF_TABLE* found = nullptr;
    EXPECT_EQ(TEV8R1_get_table_ptr(name, &found), PF_NORMAL);
    EXPECT_STREQ(tevpf_test::broken_rule(*found), nullptr);
    return *found;
  }
  static TEVPF_COLUMN& column(int i) { return table().col_array[i]; }
  static std::vector<int> order(int i) {
    const std::int32_t* entries = index_entries(column(i));
    return {entries, entries + table().num_rows};
  }

  static TEVPF_STATUS redefine(const char* name, const TEVPF_COL_DEF& def) {
    return TEV8R1_PF_modify_col_def("t", name, def);
  }
};

}  // namespace tevpf
