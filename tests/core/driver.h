// Drives every element of the current file through reading and changing operations. Whatever a file
// held, the library must take it for a list or a table like any other.
#pragma once

#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>
#include <string>
#include <vector>

#include "core/directory.h"
#include "core/file.h"
#include "core/library.h"
#include "include/tevpf.h"
#include "lists/list.h"
#include "support/temp_dir.h"
#include "tables/table.h"

inline std::string saved_bytes(const TempDir& dir) {
  const std::string path = dir / "saved";
  std::filesystem::remove(path);  // some file systems flush a file that is emptied and filled again
  EXPECT_EQ(TEV8R1_PF_save(path.c_str()), PF_NORMAL);
  return read_file(path);
}

// The current file, saved and opened again, is saved to the same bytes; it becomes current again.
inline void expect_reopens_alike(const TempDir& dir) {
  const std::string own = tevpf::library.current_file->file_name;
  const std::string bytes = saved_bytes(dir);
  write_file(dir / "again", bytes);
  ASSERT_EQ(TEV8R1_PF_open((dir / "again").c_str()), PF_NORMAL);
  EXPECT_EQ(saved_bytes(dir), bytes);
  EXPECT_EQ(TEV8R1_PF_close(0), PF_NORMAL);
  EXPECT_EQ(TEV8R1_PF_change_file(own.c_str()), PF_NORMAL);
}

inline void drive_list(const char* name) {
  TEVPF_LIST* list = nullptr;
  ASSERT_EQ(TEV8R1_get_list_ptr(name, &list), PF_NORMAL);
  TEV8R1_PF_reset_param(name);
  int walked = 0;
  std::int32_t type = 0, value_size = 0, desc_size = 0;
  while (TEV8R1_PF_inq_next_param_size(name, &type, &value_size, &desc_size) == PF_NORMAL) {
    std::vector<char> value(static_cast<std::size_t>(value_size) + 1);
    std::vector<char> desc(static_cast<std::size_t>(desc_size) + 1);
    TEVPF_PARAM_DEF def{};
    def.description = desc.data();
    if (type == PF_TYPE_STRING) def.part.str.value = value.data();
    ASSERT_EQ(TEV8R1_PF_get_next_param_def(name, &def), PF_NORMAL);
    EXPECT_EQ(def.type, type);
    const char number[sizeof(double)] = {};
    TEV8R1_PF_modify_param(name, def.name, number);
    ++walked;
  }
  EXPECT_EQ(walked, list->num_params);
  TEVPF_PARAM_DEF added{};
  added.type = PF_TYPE_INT;
  std::strcpy(added.name, "AN ADDED ONE");
  const TEVPF_STATUS status = TEV8R1_PF_add_param(name, &added, 0);
  EXPECT_TRUE(status == PF_NORMAL || status == PF_DUPLICATE) << status;
  TEV8R1_PF_move_param(name, "AN ADDED ONE", PF_END_POS);
  TEV8R1_PF_modify_param_name(name, "*", "RENAMED");
  TEV8R1_PF_delete_param(name, "*");
}

inline void drive_table(const char* name) {
  TEVPF_TABLE* table = nullptr;
  ASSERT_EQ(TEV8R1_get_table_ptr(name, &table), PF_NORMAL);
  std::vector<unsigned char> row(static_cast<std::size_t>(table->row_wid) + 64);
  TEV8R1_PF_reset_table(name);
  int walked = 0;
  while (TEV8R1_PF_get_next_row(name, row.data()) == PF_NORMAL) ++walked;
  EXPECT_EQ(walked, table->num_rows);
  for (int i = 0; i < table->num_cols; ++i) {
    const char* column = table->col_array[i].def.name;
    TEV8R1_PF_define_table_search(name, column);
    TEV8R1_PF_reset_table(name);
    while (TEV8R1_PF_get_next_row(name, row.data()) == PF_NORMAL) {
    }
  }
  const std::vector<std::int32_t> no_fields(static_cast<std::size_t>(table->num_cols) + 1);
  TEV8R1_PF_add_row_with_dft(name, row.data(), no_fields.data());
  TEVPF_COL_DEF added{};
  added.type = PF_TYPE_SHORT;
  added.width = 4;
  added.idx_flag = 1;
  std::strcpy(added.name, "AN ADDED ONE");
  TEV8R1_PF_def_column(name, added);
  row.resize(static_cast<std::size_t>(table->row_wid) + 64);
  TEV8R1_PF_add_row(name, row.data());
  TEV8R1_PF_get_row_by_pos(name, 0, row.data());
  TEV8R1_PF_delete_row(name);
  if (table->num_cols > 1) TEV8R1_PF_delete_col(name, table->col_array[0].def.name);
}

inline void drive_current_file(const TempDir& dir) {
  expect_reopens_alike(dir);
  const TEVPF_FILE& file = *tevpf::library.current_file;
  for (int i = file.num_lists - 1; i >= 0; --i) {
    const std::string name = file.list_ptr[i]->header.elem_name;
    const TEVPF_STATUS status = TEV8R1_PF_copy_list(name.c_str(), "A COPY");
    EXPECT_TRUE(status == PF_NORMAL || status == PF_DUPLICATE);
    drive_list(name.c_str());
  }
  for (int i = file.num_tables - 1; i >= 0; --i) {
    const std::string name = file.table_ptr[i]->header.elem_name;
    const TEVPF_STATUS status = TEV8R1_PF_copy_table(name.c_str(), "A COPY");
    EXPECT_TRUE(status == PF_NORMAL || status == PF_DUPLICATE);
    drive_table(name.c_str());
  }
  expect_reopens_alike(dir);
}
