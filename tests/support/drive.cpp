#include "support/drive.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <functional>
#include <memory>
#include <stdexcept>
#include <vector>

#include "include/tevpf.h"

std::uint8_t Choices::next() {
  if (bytes.empty()) return 0;
  const auto choice = static_cast<std::uint8_t>(bytes.front());
  bytes.remove_prefix(1);
  return choice;
}

void require(bool truth, const char* what) {
  if (!truth) throw std::logic_error(what);
}

namespace {

constexpr int kMostElements = 6, kMostEntries = 12;

struct FreeBlock {
  void operator()(void* block) const { std::free(block); }
};
template <class T>
using Block = std::unique_ptr<T, FreeBlock>;
using Name = char[TEVPF_NAME_SIZE];
using Desc = char[TEVPF_DESC_SIZE];

struct Names {
  std::vector<std::string> lists, tables;
};

Names element_names() {
  char file[TEVPF_FILE_NAME_SIZE];
  std::int32_t num_lists = 0, num_tables = 0;
  Name *lists = nullptr, *tables = nullptr;
  Desc *list_descs = nullptr, *table_descs = nullptr;
  TEV8R1_PF_inq_file_elements(file, &num_lists, &lists, &list_descs, &num_tables, &tables,
                              &table_descs);
  const Block<Name> a(lists), b(tables);
  const Block<Desc> d(list_descs), e(table_descs);
  Names names;
  for (int i = 0; lists != nullptr && i < std::min(num_lists, kMostElements); ++i)
    names.lists.emplace_back(lists[i]);
  for (int i = 0; tables != nullptr && i < std::min(num_tables, kMostElements); ++i)
    names.tables.emplace_back(tables[i]);
  return names;
}

void read_list(const char* list) {
  std::int32_t type, value_size, desc_size, position;
  char name[TEVPF_NAME_SIZE];
  TEV8R1_PF_reset_param(list);
  for (int i = 0; i < kMostEntries; ++i) {
    if (TEV8R1_PF_inq_next_param_size(list, &type, &value_size, &desc_size) != PF_NORMAL) break;
    std::vector<char> value(static_cast<std::size_t>(value_size)),
        desc(static_cast<std::size_t>(desc_size)), again = value;
    TEVPF_PARAM_DEF def{};
    def.description = desc.data();
    if (type == PF_TYPE_STRING) def.part.str.value = value.data();
    require(TEV8R1_PF_get_next_param_def(list, &def) == PF_NORMAL, "a parameter that has sizes");
    require(std::strlen(desc.data()) + 1 == desc.size(), "description size");
    require(type != PF_TYPE_STRING || std::strlen(value.data()) + 1 == value.size(), "value size");
    if (type != PF_TYPE_STRING)
      require(TEV8R1_load_param_value(&def, value.data()) == PF_NORMAL, "a value");
    TEV8R1_PF_reset_param(list);
    TEV8R1_set_cur_param(list, i - 1);  // refused for the first
    require(TEV8R1_PF_get_next_param(list, name, again.data()) == PF_NORMAL, "the value again");
    require(again == value, "the same value");
    TEV8R1_inq_param_pos(list, def.name, &position);
  }
}

struct Table {
  std::int32_t columns = 0, rows = 0, row_wid = 0, dsp_wid = 0, current = 0;
  explicit Table(const char* name) {
    TEV8R1_PF_inq_table_info(name, &columns, &rows, &row_wid, &dsp_wid, &current);
  }
  std::vector<unsigned char> row() const {
    return std::vector<unsigned char>(static_cast<std::size_t>(row_wid) + 1);
  }
};

void read_table(const char* table) {
  const Table info(table);
  std::vector<unsigned char> row = info.row();
  for (int c = -1; c < std::min(info.columns, kMostEntries); ++c) {
    TEVPF_COL_DEF def{};
    if (c >= 0)
      require(TEV8R1_PF_inq_col_def_by_pos(table, c, &def) == PF_NORMAL, "a column by position");
    const Block<char> description(def.description);
    TEV8R1_PF_define_table_search(table, c < 0 ? nullptr : def.name);
    TEV8R1_PF_reset_table(table);
    for (int r = 0; r < std::min(info.rows, kMostEntries); ++r) {
      require(TEV8R1_PF_get_next_row(table, row.data()) == PF_NORMAL, "a row that is counted");
      TEV8R1_convert_row(table, r);
    }
  }
  TEV8R1_PF_define_table_search(table, nullptr);
}

TEVPF_PARAM_DEF some_param(Choices& choose) {
  static char text[] = "text with\ttab", desc[] = "what it is";
  TEVPF_PARAM_DEF def{};
  def.type = PF_TYPE_INT + choose.next() % 6;
  std::snprintf(def.name, sizeof def.name, "p%d", choose.next() % 8);
  if (choose.next() % 2 != 0) def.description = desc;
  if (def.type == PF_TYPE_STRING) def.part.str.value = text;
  if (def.type == PF_TYPE_INT) def.part.i32 = {choose.next(), 300, -1};
  if (def.type == PF_TYPE_REAL) def.part.f32 = {choose.next(), 1.0f, 300.0f, -1.0f};
  if (def.type == PF_TYPE_DOUBLE) def.part.f64 = {choose.next(), 1.0, 300.0, -1.0};
  return def;
}

TEVPF_COL_DEF some_column(Choices& choose) {
  TEVPF_COL_DEF def{};
  def.type = PF_TYPE_INT + choose.next() % 6;
  std::snprintf(def.name, sizeof def.name, "c%d", choose.next() % 8);
  def.idx_flag = choose.next() % 2;
  def.unq_flag = choose.next() % 2;
  def.width = choose.next() % 40;
  if (def.type == PF_TYPE_INT) def.limits.i32 = {1000, -1000};
  if (def.type == PF_TYPE_REAL) def.limits.f32 = {1000.0f, 0.0f, choose.next()};
  if (def.type == PF_TYPE_DOUBLE) def.limits.f64 = {1000.0, 0.0, choose.next()};
  if (def.type == PF_TYPE_SHORT) def.limits.i16 = {1000, 0};
  return def;
}

std::string any_param(const char* list, Choices& choose) {
  std::int32_t count = 0, type, value_size, desc_size;
  TEV8R1_PF_inq_num_params(list, &count);
  char name[TEVPF_NAME_SIZE] = "p*";
  const std::int32_t pos = count > 0 ? choose.next() % count : 0;
  if (choose.next() % 4 != 0 &&
      TEV8R1_PF_inq_param_size_by_pos(list, pos, &type, &value_size, &desc_size) == PF_NORMAL) {
    std::vector<char> value(static_cast<std::size_t>(value_size));
    TEV8R1_PF_reset_param(list);
    if (pos > 0) TEV8R1_set_cur_param(list, pos - 1);
    TEV8R1_PF_get_next_param(list, name, value.data());
  }
  return name;
}

void change_list(const char* list, Choices& choose) {
  const std::string name = any_param(list, choose);
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

std::string any_column(const char* table, Choices& choose) {
  std::int32_t count = 0;
  Name* names = nullptr;
  TEV8R1_PF_inq_col_names(table, &count, &names);
  const Block<Name> owner(names);
  return count == 0 || names == nullptr ? "c1" : names[choose.next() % count];
}

void change_table(const char* table, Choices& choose) {
  const Table info(table);
  std::vector<unsigned char> row = info.row();
  TEV8R1_PF_inq_dft_row(table, row.data());
  const std::string name = any_column(table, choose), other = any_column(table, choose);
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
  changes[info.columns == 0 ? 0 : choose.next() % std::size(changes)]();
}

void read_everything(const std::string& text) {
  const Names names = element_names();
  TEV8R1_PF_dump_file(text.c_str());
  for (const std::string& list : names.lists) {
    read_list(list.c_str());
    TEV8R1_PF_dump_list(list.c_str(), text.c_str());
  }
  for (const std::string& table : names.tables) {
    read_table(table.c_str());
    TEV8R1_PF_dump_table(table.c_str(), text.c_str());
    TEV8R1_PF_print_table(table.c_str(), text.c_str(), 1, PF_END_POS, nullptr, -1, PF_END_POS);
  }
  std::remove(text.c_str());
}

// The current file's bytes; "" when an unknown type was loaded half-way.
std::string saved(const std::string& path) {
  const bool done = TEV8R1_PF_save(path.c_str()) == PF_NORMAL;
  std::ifstream in(path, std::ios::binary);
  const std::string bytes(std::istreambuf_iterator<char>(in), {});
  if (!done) std::remove(path.c_str());
  return done ? bytes : "";
}

// A file that was saved is read back and saved to the same bytes.
void save_and_compare(const std::string& folder) {
  const std::string copy = folder + "/copy", again = folder + "/again";
  char own[TEVPF_FILE_NAME_SIZE];
  TEV8R1_turn_off_interactive();
  TEV8R1_PF_inq_current_file(own);
  if (const std::string bytes = saved(copy); !bytes.empty()) {
    require(TEV8R1_PF_open(copy.c_str()) == PF_NORMAL, "a saved file opens");
    require(saved(again) == bytes, "a saved file holds what was saved");
    TEV8R1_PF_close(0);
    TEV8R1_PF_change_file(own);
  }
  // Some file systems flush a file that is emptied and filled again.
  for (const std::string& path : {copy, again}) std::remove(path.c_str());
}

}  // namespace

void drive_current_file(const std::string& folder, Choices choose) {
  read_everything(folder + "/text");
  save_and_compare(folder);
  while (!choose.bytes.empty()) {
    const Names names = element_names();
    const std::uint8_t which = choose.next();
    if (which % 2 != 0 && !names.lists.empty())
      change_list(names.lists[which / 2 % names.lists.size()].c_str(), choose);
    if (which % 2 == 0 && !names.tables.empty())
      change_table(names.tables[which / 2 % names.tables.size()].c_str(), choose);
    if (which == 255) TEV8R1_PF_create_elem("made", "", 1 + choose.next() % 2);
  }
  read_everything(folder + "/text");
  save_and_compare(folder);
}
