#include "support/drive.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <functional>
#include <span>
#include <vector>

#include "core/file.h"
#include "core/library.h"
#include "support/list_check.h"
#include "support/param_def.h"
#include "support/read_file.h"
#include "support/table_check.h"

std::uint8_t Choices::next() {
  if (bytes.empty()) return 0;
  const auto choice = static_cast<std::uint8_t>(bytes.front());
  bytes.remove_prefix(1);
  return choice;
}

namespace {

constexpr std::int32_t kMostElements = 6, kMostEntries = 12;  // of those that a file holds

template <class Record>
std::vector<Record*> elements(std::int32_t type) {
  const tevpf::Directory& directory = tevpf::directory_of(*tevpf::library.current_file, type);
  std::vector<Record*> all;
  for (std::int32_t i = 0; i < std::min(directory.count, kMostElements); ++i) {
    all.push_back(reinterpret_cast<Record*>(directory.entries[i]));
  }
  return all;
}
auto lists() { return elements<TEVPF_LIST>(PF_ELEM_LIST); }

// Tables with rows that fit a buffer: a file may ask for rows of gigabytes as long as it has none.
auto tables() {
  constexpr std::int32_t kWidestRow = 1 << 24;
  std::vector<TEVPF_TABLE*> all = elements<TEVPF_TABLE>(PF_ELEM_TABLE);
  std::erase_if(all, [](const TEVPF_TABLE* table) { return table->row_wid > kWidestRow; });
  return all;
}

void read_list(const char* list) {
  std::int32_t type, value_size, desc_size, position;
  char name[TEVPF_NAME_SIZE];
  TEV8R1_PF_reset_param(list);
  for (int i = 0; i < kMostEntries; ++i) {
    if (TEV8R1_PF_inq_next_param_size(list, &type, &value_size, &desc_size) != PF_NORMAL) break;
    DefBuffers out(value_size, desc_size);
    std::vector<char> again(value_size);
    require(TEV8R1_PF_get_next_param_def(list, &out.c) == PF_NORMAL, "a parameter that has sizes");
    require(std::strlen(out.description.data()) + 1 == out.description.size(), "description size");
    if (type == PF_TYPE_STRING) {
      require(std::strlen(out.value.data()) + 1 == out.value.size(), "value size");
    } else {
      require(TEV8R1_load_param_value(&out.c, out.value.data()) == PF_NORMAL, "a value");
    }
    TEV8R1_PF_reset_param(list);
    TEV8R1_set_cur_param(list, i - 1);  // refused for the first
    require(TEV8R1_PF_get_next_param(list, name, again.data()) == PF_NORMAL, "the value again");
    require(again == out.value, "the same value");
    TEV8R1_inq_param_pos(list, out.c.name, &position);
  }
}

std::vector<unsigned char> row_buffer(const TEVPF_TABLE& table) {
  return std::vector<unsigned char>(table.row_wid + std::size_t{1});
}

void read_table(const TEVPF_TABLE& info) {
  const char* const table = info.header.elem_name;
  std::vector<unsigned char> row = row_buffer(info);
  for (int c = -1; c < std::min(info.num_cols, kMostEntries); ++c) {
    TEVPF_COL_DEF def{};
    if (c >= 0)
      require(TEV8R1_PF_inq_col_def_by_pos(table, c, &def) == PF_NORMAL, "a column by position");
    TEV8R1_PF_define_table_search(table, c < 0 ? nullptr : def.name);
    std::free(def.description);
    TEV8R1_PF_reset_table(table);
    for (int r = 0; r < std::min(info.num_rows, kMostEntries); ++r) {
      require(TEV8R1_PF_get_next_row(table, row.data()) == PF_NORMAL, "a row that is counted");
      TEV8R1_convert_row(table, r);
    }
  }
  TEV8R1_PF_define_table_search(table, nullptr);
}

TEVPF_PARAM_DEF some_param(Choices& choose) {
  static Def def;
  def = {.type = PF_TYPE_INT + choose.next() % 6,
         .name = "p" + std::to_string(choose.next() % 8),
         .max = 300,
         .min = -1,
         .precision = 1,
         .text = "text with\ttab"};
  if (choose.next() % 2 != 0) def.description = "what it is";
  if (def.type < PF_TYPE_SHORT && def.type != PF_TYPE_STRING) def.value = choose.next();
  return to_c(def);
}

TEVPF_COL_DEF some_column(Choices& choose) {
  const std::int32_t type = PF_TYPE_INT + choose.next() % 6;
  const std::string name = "c" + std::to_string(choose.next() % 8);
  const std::int8_t index = choose.next() % 2, unique = choose.next() % 2;
  const int width = choose.next() % 40,
            precision = tevpf::is_floating_type(type) ? choose.next() : 0;
  const int min = type == PF_TYPE_INT ? -1000 : 0;
  TEVPF_COL_DEF def = tevpf::col(name.c_str(), type, width, {double(min), 1000, precision});
  def.idx_flag = index;
  def.unq_flag = unique;
  return def;
}

void change_list(const TEVPF_LIST& info, Choices& choose) {
  const char* const list = info.header.elem_name;
  const std::int32_t pos = info.num_params > 0 ? choose.next() % info.num_params : 0;
  const bool pick = choose.next() % 4 != 0 && info.num_params > 0;
  const std::string name = pick ? info.param_ptr[pos].def.name : "p*";
  const TEVPF_PARAM_DEF def = some_param(choose);
  const std::int32_t where = choose.next() % 2 != 0 ? PF_END_POS : choose.next() - 5;
  const double value[4] = {choose.next() * 0.5, 0, 0, 0};
  const std::function<void()> changes[] = {
      [&] { TEV8R1_PF_add_param(list, &def, where); },
      [&] { TEV8R1_PF_delete_param(list, name.c_str()); },
      [&] { TEV8R1_PF_modify_param_def(list, def); },
      [&] { TEV8R1_PF_modify_param_name(list, name.c_str(), def.name); },
      [&] { TEV8R1_PF_move_param(list, name.c_str(), where); },
      [&] { TEV8R1_PF_modify_param(list, name.c_str(), value); },
      [&] { TEV8R1_PF_copy_list(list, def.name); },
      [&] { TEV8R1_PF_set_param_dft(list, def); },
  };
  changes[choose.next() % std::size(changes)]();
}

std::string any_column(const TEVPF_TABLE& table, Choices& choose) {
  return table.num_cols == 0 ? "c1" : table.col_array[choose.next() % table.num_cols].def.name;
}

void change_table(const TEVPF_TABLE& info, Choices& choose) {
  const char* const table = info.header.elem_name;
  std::vector<unsigned char> row = row_buffer(info);
  TEV8R1_PF_inq_dft_row(table, row.data());
  const std::string name = any_column(info, choose), other = any_column(info, choose);
  const char* const column = name.c_str();
  TEVPF_COL_DEF def = some_column(choose);
  for (int i = choose.next() % 8; i > 0; --i) row[choose.next() % row.size()] = choose.next();
  const std::int32_t at = choose.next() % 4 == 0 ? PF_END_POS : choose.next() - 3;
  const char key[64] = "a*";
  const auto redefine = [&] { TEV8R1_PF_modify_col_def(table, column, def); };
  const std::function<void()> changes[] = {
      [&] { TEV8R1_PF_def_column(table, def); },
      [&] { std::snprintf(def.name, sizeof def.name, "%.19s", column), redefine(); },
      redefine,
      [&] { TEV8R1_PF_delete_col(table, column); },
      [&] { TEV8R1_PF_move_col(table, column, choose.next() % 2 ? other.c_str() : nullptr); },
      [&] { TEV8R1_PF_add_row(table, row.data()); },
      [&] { TEV8R1_PF_add_row_by_pos(table, row.data(), at); },
      [&] { TEV8R1_PF_get_row_by_pos(table, at, row.data()), TEV8R1_PF_delete_row(table); },
      [&] {
        TEV8R1_PF_get_next_row(table, row.data());
        row[0] ^= 1;
        TEV8R1_PF_replace_row(table, row.data());
      },
      [&] { TEV8R1_PF_move_row(table, choose.next() % 8, at); },
      [&] { TEV8R1_PF_define_table_search(table, column); },
      [&] { TEV8R1_PF_get_row_by_value(table, 1, column, key, row.data()); },
      [&] { TEV8R1_PF_get_value(table, column, key, row.data()); },
      [&] { TEV8R1_set_interactive_table(table), TEV8R1_PF_set_dft_row(table, row.data()); },
      [&] { TEV8R1_PF_copy_table(table, def.name); },
      [&] {
        TEV8R1_turn_off_interactive();
        row.back() = 0;  // a value that is a text ends
        TEV8R1_validate_row_value(table, column, row.data());
      },
  };
  // Rows of a table without columns are not stored.
  changes[info.num_cols == 0 ? 0 : choose.next() % std::size(changes)]();
}

// An index is in the order that the file says; all other invariants are kept whatever it says.
void require_kept(const char* broken_rule) {
  if (broken_rule != nullptr) require(std::strstr(broken_rule, "order") != nullptr, broken_rule);
}

void require_rules() {
  for (const TEVPF_LIST* list : lists()) require_kept(broken_rule(*list));
  for (const TEVPF_TABLE* table : tables()) require_kept(tevpf_test::broken_rule(*table));
}

void read_everything(const std::string& text) {
  require_rules();
  TEV8R1_PF_dump_file(text.c_str());
  for (const TEVPF_LIST* list : lists()) read_list(list->header.elem_name);
  for (const TEVPF_TABLE* table : tables()) {
    read_table(*table);
    TEV8R1_PF_print_table(table->header.elem_name, text.c_str(), 1, PF_END_POS, nullptr, -1,
                          PF_END_POS);
  }
  std::remove(text.c_str());
}

}  // namespace

bool save_and_compare(const std::string& folder) {
  const std::string copy = folder + "/copy", again = folder + "/again";
  char own[TEVPF_FILE_NAME_SIZE];
  TEV8R1_turn_off_interactive();
  TEV8R1_PF_inq_current_file(own);
  const bool saved = TEV8R1_PF_save(copy.c_str()) == PF_NORMAL;
  if (const std::string bytes = read_file(copy); saved && !bytes.empty()) {
    const TEVPF_STATUS opened = TEV8R1_PF_open(copy.c_str());
    // A table too wide for the heap stays without its default row; what follows it is not read.
    require(opened == PF_NORMAL || opened == PF_NOMEM, "a saved file opens");
    require_rules();
    require(TEV8R1_PF_save(again.c_str()) == PF_NORMAL, "a saved file can be saved");
    require(opened == PF_NOMEM || read_file(again) == bytes, "a saved file holds what was saved");
    TEV8R1_PF_close(0);
    TEV8R1_PF_change_file(own);
  }
  // Some file systems flush a file that is emptied and filled again.
  for (const std::string& path : {copy, again}) std::remove(path.c_str());
  return saved;
}

void drive_current_file(const std::string& folder, Choices choose) {
  read_everything(folder + "/text");
  save_and_compare(folder);
  while (!choose.bytes.empty()) {
    const std::uint8_t which = choose.next();
    if (which % 2 != 0 && !lists().empty())
      change_list(*lists()[which / 2 % lists().size()], choose);
    if (which % 2 == 0 && !tables().empty())
      change_table(*tables()[which / 2 % tables().size()], choose);
    if (which == 255) TEV8R1_PF_create_elem("made", "", 1 + choose.next() % 2);
  }
  read_everything(folder + "/text");
  save_and_compare(folder);
}
