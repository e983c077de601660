// The library's state as bytes, what files hold as they are saved and what is not saved; and all its
// elements held against their invariants.
#pragma once

#include <gtest/gtest.h>

#include <cstdlib>
#include <span>
#include <string>

#include "core/file.h"
#include "core/library.h"
#include "core/writer.h"
#include "lists/directory.h"
#include "support/list_check.h"
#include "support/memory_stream.h"
#include "support/param_def.h"
#include "support/table_check.h"
#include "tables/directory.h"

template <class... T>
void put(std::string& all, const T&... values) {
  (all.append(reinterpret_cast<const char*>(&values), sizeof values), ...);
}

inline void put_stored(std::string& all, const TEVPF_FILE& file) {
  MemoryStream stream;
  EXPECT_EQ(tevpf::write_elements(file, stream.get(), ""), PF_NORMAL);
  all += stream.bytes();
}

inline void put_table(std::string& all, const TEVPF_TABLE& table) {
  put(all, table.dsp_wid, table.next_row, table.cur_row);
  for (const TEVPF_COLUMN& column : std::span(table.col_array, table.num_cols)) {
    all += column.format;
    put(all, column.tolerance, &column == table.cur_col);
  }
  if (table.dft_row != nullptr) all.append(table.dft_row, table.dft_row + table.row_wid);
  for (int i = 0; table.col_dft != nullptr && i < tevpf::kValueTypeCount; ++i) {
    TEVPF_COL_DEF def = table.col_dft[i];
    if (def.description != nullptr) all += def.description;
    def.description = nullptr;
    put(all, def);
  }
}

inline std::string snapshot(bool with_spare_slots) {
  const tevpf::Library& library = tevpf::library;
  std::string all;
  put(all, library.num_files, library.interactive, library.alloc_initial, library.alloc_increment);
  if (library.current_file != nullptr) all += library.current_file->file_name;
  for (const TEVPF_FILE* f = library.first_file; f != nullptr; f = f->next_file) {
    all += f->file_name;
    put(all, f->read_only);
    put_stored(all, *f);
    for (int n = 0; n < tevpf::directory_of(*f, PF_ELEM_LIST).count; ++n) {
      const TEVPF_LIST* list = &tevpf::list_at(*f, n);
      put(all, list->cur_param);
      for (int i = 0; list->dft_ptr != nullptr && i < tevpf::kValueTypeCount; ++i) {
        all += text_of(list->dft_ptr[i]);
      }
      if (with_spare_slots) put(all, list->free_params);
    }
    for (int n = 0; n < tevpf::directory_of(*f, PF_ELEM_TABLE).count; ++n) {
      const TEVPF_TABLE* table = &tevpf::table_at(*f, n);
      put_table(all, *table);
      if (with_spare_slots) put(all, table->free_rows, table->free_cols);
    }
  }
  return all;
}

// The first broken rule of each list and table.
inline std::string broken_rules() {
  std::string all;
  const auto note = [&](const char* rule) {
    all += rule == nullptr ? "" : rule + std::string("; ");
  };
  for (const TEVPF_FILE* f = tevpf::library.first_file; f != nullptr; f = f->next_file) {
    for (int n = 0; n < tevpf::directory_of(*f, PF_ELEM_LIST).count; ++n)
      note(broken_rule(tevpf::list_at(*f, n)));
    for (int n = 0; n < tevpf::directory_of(*f, PF_ELEM_TABLE).count; ++n)
      note(tevpf_test::broken_rule(tevpf::table_at(*f, n)));
  }
  return all;
}
