// A table "t" in a new file.
#pragma once

#include <string>
#include <vector>

#include "support/definitions.h"
#include "support/temp_file.h"
#include "tables/column_index.h"
#include "tables/directory.h"
#include "tables/row_store.h"

#define ASSERT_OK(expr) ASSERT_EQ(expr, PF_NORMAL)

namespace tevpf {

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
    EXPECT_EQ(find_table(name, found), PF_NORMAL);
    return *found;
  }
  static void expect_no_broken_rule() { EXPECT_STREQ(tevpf_test::broken_rule(table()), nullptr); }
  // The record as callers outside get it: rows in order, indexes one array each.
  static TEVPF_TABLE& settled() {
    TEVPF_TABLE* found = nullptr;
    EXPECT_EQ(TEV8R1_get_table_ptr("t", &found), PF_NORMAL);
    expect_no_broken_rule();
    return *found;
  }
  static TEVPF_COLUMN& column(int i) { return settled().col_array[i]; }
  // The row numbers in the order of an index, whatever state it is in.
  static std::vector<int> order(int i) {
    const TEVPF_TABLE& t = table();
    std::vector<int> rows(t.num_rows);
    t.col_array[i].index.copy_items(t.num_rows, rows.data());
    for (int& row : rows) row = row_number_of(t, row);
    return rows;
  }

  static void define(const std::vector<TEVPF_COL_DEF>& defs) {
    for (const TEVPF_COL_DEF& def : defs) ASSERT_OK(TEV8R1_PF_def_column("t", def)) << def.name;
  }
  // Adds a row of values that stand here as texts; its padding is rubbish.
  static TEVPF_STATUS add(const std::vector<const char*>& values) {
    std::string row(table().row_wid, '\x55');
    for (int i = 0; i < table().num_cols; ++i) {
      char* const place = &row[column(i).offset];
      EXPECT_EQ(TEV8R1_from_char(column(i).def.type, values[i], place), PF_NORMAL);
    }
    return TEV8R1_PF_add_row("t", row.data());
  }
  static TEVPF_STATUS redefine(const char* name, const TEVPF_COL_DEF& def) {
    return TEV8R1_PF_modify_col_def("t", name, def);
  }
};

}  // namespace tevpf
