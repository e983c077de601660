#include "robustness/operations.h"

#include "core/base/status.h"
#include "core/file.h"
#include "core/library.h"
#include "core/reader.h"
#include "core/writer.h"
#include "lists/directory.h"
#include "lists/list_builder.h"
#include "lists/list_writer.h"
#include "lists/name_index.h"
#include "lists/param_check.h"
#include "lists/param_record.h"
#include "reports/definition_text.h"
#include "reports/display.h"
#include "reports/list_dump.h"
#include "reports/row_text.h"
#include "reports/table_dump.h"
#include "reports/table_listing.h"
#include "support/param_def.h"
#include "tables/column_index.h"
#include "tables/column_record.h"
#include "tables/columns.h"
#include "tables/cursor.h"
#include "tables/default_row.h"
#include "tables/formats.h"
#include "tables/layout.h"
#include "tables/rows.h"
#include "tables/settle.h"
#include "tables/table_builder.h"
#include "tables/table_writer.h"
#include "tables/templates.h"
#include "tables/validate.h"

namespace {

constexpr const char* kNames[] = {"int", "real", "string", "double", "short"};  // by type

// What operations read and write.
char long_text[] = "a text that is longer than those that are there\t";
char text_out[4096], text_too[4096];
std::int32_t out[8], entries[4];
double real_out;
std::int16_t short_out;
alignas(8) unsigned char row[512];
void* found_row;
TEVPF_LIST* found_list;
TEVPF_TABLE* found_table;
TEVPF_PARAM* found_param;
TEVPF_COLUMN* found_column;

TEVPF_LIST& list() {
  EXPECT_EQ(tevpf::find_list("list", found_list), PF_NORMAL);
  return *found_list;
}
TEVPF_TABLE& table(const char* name = "t") {
  EXPECT_EQ(tevpf::find_table(name, found_table), PF_NORMAL);
  return *found_table;
}

constexpr std::int32_t kRows = 9;

// A definition from its numbers: type, value, max, min, precision or length.
TEVPF_PARAM_DEF param(const char* name, Numbers n) {
  const double value = n[1], max = n[2], min = n[3];
  TEVPF_PARAM_DEF def = to_c({n[0], name, "", {}, value, max, min, n[4], "", n[4]});
  def.description = long_text;
  if (def.type == PF_TYPE_STRING) def.part.str.value = long_text;
  return def;
}

// The same for columns: type, width, max, min, precision, idx_flag, unq_flag.
TEVPF_COL_DEF column(const char* name, Numbers n) {
  TEVPF_COL_DEF def = tevpf::col(name, n[0], n[1], {double(n[3]), double(n[2]), n[4]});
  def.idx_flag = std::int8_t(n[5]);
  def.unq_flag = std::int8_t(n[6]);
  return tevpf::described(def, long_text);
}

// A row that fits the tables; its text has no terminator.
unsigned char* new_row(std::int32_t number = 999) {
  std::memset(row, 0, sizeof row);
  std::memcpy(row, &number, sizeof number);
  std::memset(row + sizeof number, 'x', 9);
  TEV8R1_from_char(PF_TYPE_REAL, "0.1", row + 16);
  TEV8R1_from_char(PF_TYPE_DOUBLE, "98.7654321", row + 24);
  return row;
}

TEVPF_PARAM_DEF* buffers() {
  static TEVPF_PARAM_DEF def;
  def = {};
  def.description = text_too;
  def.part.str.value = text_out;
  return &def;
}

void release(void* block) {
  if (block != long_text) std::free(block);
}
void release(const TEVPF_COL_DEF& def) { release(def.description); }
void release(const TEVPF_PARAM_DEF& def) {
  release(def.description);
  if (def.type == PF_TYPE_STRING) release(def.part.str.value);
}
void release(const TEVPF_COLUMN& column) { release(column.def); }
void release(const TEVPF_PARAM& param) { release(param.def); }
// What operations hand out, released at the end of the call's expression.
template <class T>
struct Handed {
  ~Handed() { release(made); }
  T* to() { return &made; }
  T made{};
};
using HandedParam = Handed<TEVPF_PARAM_DEF>;
using HandedColumn = Handed<TEVPF_COL_DEF>;
using Names = Handed<char (*)[TEVPF_NAME_SIZE]>;
using Descs = Handed<char (*)[TEVPF_DESC_SIZE]>;

template <class T>
T* at(T&& temporary) {
  return &temporary;
}
template <class Record, class Definition>
Record with(const Definition& def) {
  Record record{};
  record.def = def;
  return record;
}
template <class T>
T* zeroed() {
  return static_cast<T*>(std::calloc(1, sizeof(T)));
}

std::FILE* nowhere() {
  static std::FILE* const stream = std::tmpfile();
  return stream;
}

// The stored form of an element of the current file: a body as long as asked, and what follows it.
struct Stored {
  template <class Store, class Element>
  Stored(Store store, Element* element, std::int32_t body_bytes) {
    store(stream, element);
    std::rewind(stream);
    EXPECT_EQ(std::fread(&header, sizeof header, 1, stream), 1u);
    body.resize(std::size_t(header.btf));
    EXPECT_EQ(std::fread(body.data(), 1, body.size(), stream), body.size());
    std::strcpy(header.elem_name, "new");
    header.btf = std::min(header.btf, body_bytes);
  }
  ~Stored() { std::fclose(stream); }
  std::FILE* stream = std::tmpfile();
  TEVPF_ELEM_HEADER header{};
  std::vector<char> body;
};

// ---- The rows ------------------------------------------------------------------------------------

// An operation, its arguments, and the usual numbers that stand in them as n.
// clang-format off
#define CALL(operation, arguments, ...) MORE(operation, kNone, arguments, __VA_ARGS__)
#define MORE(operation, leeway, arguments, ...)                                                  \
  Call{#operation, {__VA_ARGS__},                                                                \
       [=]([[maybe_unused]] Numbers n) -> TEVPF_STATUS {                                         \
         return static_cast<TEVPF_STATUS>(TEV8R1_##operation arguments);                         \
       }, leeway, #arguments}

void add_file_calls(std::vector<Call>& calls, const TempDir& dir) {
  const std::string file = dir / "file", other = dir / "other", copy = dir / "copy", fresh = dir / "new";
  calls.insert(calls.end(), {
    CALL(PF_init, ()), MORE(PF_open, kPartStays, (other.c_str())), CALL(PF_open, (fresh.c_str())),
    CALL(PF_change_file, (file.c_str())), CALL(PF_inq_current_file, (text_out)),
    CALL(PF_inq_file_access, (out)),
    CALL(PF_inq_file_elements, (text_out, out, Names().to(), Descs().to(), out + 1, Names().to(),
                                Descs().to())),
    CALL(PF_save, (nullptr)), CALL(PF_save, (copy.c_str())), CALL(PF_close, (n[0]), 0),
    MORE(PF_set_memory_allocation, kPartStays, (n[0], n[1]), 3, 1),
    {"PF_set_memory_allocation", {3, 1}, [](Numbers n) {
       TEV8R1_PF_set_memory_allocation(n[0], n[1]);
       const std::int32_t numbers[5] = {PF_TYPE_INT};
       TEV8R1_PF_add_param("list", at(param("new", numbers)), 0);
       TEV8R1_PF_add_row("t", new_row());
       TEV8R1_PF_add_row("empty", new_row());
       return TEV8R1_PF_create_elem("new", "", PF_ELEM_LIST);
     }, kNumbersOnly},
    {"add_file", {1}, [=](Numbers n) {
       std::FILE* const stream = std::fopen(other.c_str(), "rb");
       const TEVPF_STATUS status = TEV8R1_add_file(stream, "added", std::uint8_t(n[0]));
       if (status != PF_NORMAL) std::fclose(stream);
       return status;
     }},
    CALL(free_file, (zeroed<TEVPF_FILE>())), CALL(check_valid_file, (tevpf::library.current_file)),
    CALL(store_file, (tevpf::library.current_file)), CALL(store_list, (nowhere(), &list())),
    CALL(store_table, (nowhere(), &table())),
    {"format_list", {INT32_MAX}, [](Numbers n) {
       const Stored stored(TEV8R1_store_list, &list(), n[0]);
       return TEV8R1_format_list(stored.header, stored.body.data(), stored.stream);
     }, kPartStays},
    {"format_table", {INT32_MAX}, [](Numbers n) {
       const Stored stored(TEV8R1_store_table, &table(), n[0]);
       return TEV8R1_format_table(stored.header, stored.body.data(), stored.stream);
     }, kPartStays},
  });
}

void add_element_calls(std::vector<Call>& calls) {
  calls.insert(calls.end(), {
    MORE(PF_create_elem, kPartStays, ("new", long_text, n[0]), PF_ELEM_LIST),
    CALL(PF_create_elem, ("new", long_text, n[0]), PF_ELEM_TABLE),
    CALL(check_list_unique, ("list")), CALL(check_table_unique, ("new")),
    CALL(modify_elem_name, (n[0], "list", "new"), PF_ELEM_LIST),
    CALL(modify_elem_desc, (n[0], "t", long_text), PF_ELEM_TABLE), CALL(PF_delete_list, ("list")),
    CALL(PF_delete_table, ("t")), CALL(PF_copy_list, ("list", "new")),
    CALL(PF_copy_table, ("t", "new")),
    CALL(create_list, ({PF_ELEM_LIST, "new", "", 12}, &found_list)),
    CALL(create_table, ({PF_ELEM_TABLE, "new", "", 24}, &found_table)),
    {"insert_list", {}, [](Numbers) {
       const TEVPF_STATUS status = TEV8R1_insert_list(&found_list);
       if (status == PF_NORMAL) found_list->header = {PF_ELEM_LIST, "new", "", 12};
       return status;
     }},
    {"insert_table", {}, [](Numbers) {
       const TEVPF_STATUS status = TEV8R1_insert_table(&found_table);
       if (status == PF_NORMAL) found_table->header = {PF_ELEM_TABLE, "new", "", 24};
       return status;
     }},
    CALL(get_list_ptr, ("list", &found_list)), CALL(get_table_ptr, ("empty", &found_table)),
    CALL(get_list_array_pos, (&list(), out)), CALL(get_table_array_pos, (&table(), out)),
    CALL(free_list, (zeroed<TEVPF_LIST>())), CALL(free_table, (zeroed<TEVPF_TABLE>())),
  });
}

void add_value_calls(std::vector<Call>& calls) {
  static const std::int32_t index[] = {0, 1, 2};
  calls.insert(calls.end(), {
    CALL(compute_size, (n[0], n[1], out), PF_TYPE_STRING, 8),
    CALL(from_char, (n[0], "12", out), PF_TYPE_INT), CALL(convert_int, ("12", out)),
    CALL(convert_short, ("12", &short_out)), CALL(convert_double, ("12", &real_out)),
    CALL(to_char, (n[0], nullptr, long_text, text_out, out), PF_TYPE_STRING),
    MORE(compare, kNoStatus, (n[0], n + 1, n + 2, 0), PF_TYPE_INT, 5, 6),
    MORE(string_compare, kNoStatus, ("a", "b")),
    CALL(memcpy, (std::min(n[0], 9), long_text, text_out), 4),
    {"strdup", {}, [](Numbers) {
       const Handed<char*> copy{TEV8R1_strdup(long_text)};
       if (copy.made == nullptr) set_error_texts(kEmpty);
       return copy.made == nullptr ? PF_NOMEM : PF_NORMAL;
     }},
    CALL(allocate_elem, (n[0], n[1], n[2], Handed<void*>().to(), &found_row), 0, 3, 4),
    CALL(insert_index_value, (entries, 3, n[0], n[1]), 2, 7),
    CALL(remove_index, (entries, n[0], 3), 1),
    CALL(binary_search, (n[0], 0, std::min(n[1], 3), 4, index, index, n + 2, out), PF_TYPE_INT, 3, 1),
    CALL(adjust_index, (n[0], std::int16_t(n[1]), Handed<std::int32_t*>().to()), 5, 3),
    CALL(adjust_default, (Handed<void*>().to(), 12, at(column("x", n)), 4, 8), PF_TYPE_INT, 5, 9, 1, 0, 0, 0),
  });
}

void add_list_calls(std::vector<Call>& calls) {
  for (std::int32_t type = PF_TYPE_INT; type <= PF_TYPE_SHORT; ++type) {
    calls.insert(calls.end(), {
      CALL(PF_add_param, ("list", at(param("new", n)), n[5]), type, 1, 9, -9, 3, PF_END_POS),
      CALL(PF_modify_param_def, ("list", param("string", n)), type, 1, 9, -9, 3),
      CALL(PF_modify_param_def, ("list", param("double", n)), type, 1, 9, -9, 3),
      CALL(PF_set_param_dft, ("list", param("default", n)), type, 1, 9, -9, 3),
      MORE(PF_set_param_dft, kPartStays, ("none", param("default", n)), type, 1, 9, -9, 3),
      CALL(validate_param_def, (&list(), param("new", n)), type, 1, 9, -9, 3),
      CALL(load_param_value, (at(param("new", n)), text_out), type, 1, 9, -9, 3),
      CALL(construct_param, (Handed<TEVPF_PARAM>{with<TEVPF_PARAM>(param("new", n))}.to(), out), type,
           1, 9, -9, 3),
      CALL(store_param_value, (n[0], "12", HandedParam{{n[0], "", "", nullptr, {}}}.to()), type),
      CALL(PF_inq_param_dft, ("list", n[0], HandedParam().to()), type),
      CALL(calc_param_bytes, (n[0], long_text, n[1], out), type, 7),
      CALL(adjust_param_size_btf, (n[0], n[1], out), type, PF_TYPE_INT),
    });
  }
  calls.insert(calls.end(), {
    CALL(PF_delete_param, ("list", "string")), CALL(PF_modify_param_name, ("list", "int", "zero")),
    CALL(PF_move_param, ("list", "double", n[0]), 0), CALL(PF_modify_param, ("list", "int", n), 5),
    CALL(PF_modify_param, ("list", "string", std::string(200, 'v').c_str())),
    CALL(PF_get_param_value, ("list", "str*", text_out)),
    {"load_param_dft", {}, [](Numbers) {
       Handed<TEVPF_PARAM_DEF*> made;
       const TEVPF_STATUS status = TEV8R1_load_param_dft(made.to());
       if (status == PF_NORMAL) std::free(made.made[PF_TYPE_STRING - PF_TYPE_INT].part.str.value);
       return status;
     }},
    MORE(PF_inq_param_dft, kPartStays, ("none", n[0], HandedParam().to()), PF_TYPE_STRING),
    CALL(PF_get_next_param, ("list", text_too, text_out)),
    CALL(PF_get_next_param_def, ("list", buffers())),
    CALL(PF_get_prev_param_def, ("list", buffers())),
    CALL(PF_get_param_def, ("list", "string", buffers())),
    CALL(PF_get_param_def_by_pos, ("list", n[0], buffers()), 2),
    CALL(PF_inq_param_size, ("list", "int", out, out + 1, out + 2)),
    CALL(PF_inq_param_size_by_pos, ("list", n[0], out, out + 1, out + 2), 1),
    CALL(PF_inq_next_param_size, ("list", out, out + 1, out + 2)),
    CALL(PF_inq_num_params, ("list", out)), CALL(PF_reset_param, ("list")),
    CALL(set_cur_param, ("list", n[0]), 1), CALL(inq_param_pos, ("list", "int", out)),
    CALL(inq_param_exists, ("list", "int")), CALL(get_param_type, ("list", "int", out)),
    CALL(set_interactive_list, ("list")),
    {"list_binary_search", {}, [](Numbers) {
       const TEVPF_STATUS status = TEV8R1_get_list_ptr("list", &found_list);
       if (status != PF_NORMAL) return status;
       const TEVPF_LIST& flat = *found_list;
       return TEV8R1_list_binary_search(flat.param_ptr, flat.num_params, flat.index_ptr, "int", out);
     }},
    CALL(get_param_ptr, (&list(), "int", &found_param, out)),
    {"remove_param_from_index", {}, [](Numbers) {
       const TEVPF_STATUS status = TEV8R1_get_list_ptr("list", &found_list);
       if (status != PF_NORMAL) return status;
       TEVPF_LIST alike = *found_list;
       std::vector<std::int32_t> index(alike.index_ptr, alike.index_ptr + alike.num_params);
       alike.index_ptr = index.data();
       alike.names = {};
       return TEV8R1_remove_param_from_index(&alike, 1);
     }},
  });
}

void add_column_calls(std::vector<Call>& calls) {
  for (std::int32_t type = PF_TYPE_INT; type <= PF_TYPE_SHORT; ++type) {
    for (const char* t : {"t", "empty"}) {
      const char* const own = kNames[type - PF_TYPE_INT];
      calls.insert(calls.end(), {
        CALL(PF_def_column, (t, column("new", n)), type, 8, 99, 0, 3, 0, 0),
        CALL(PF_def_column, (t, column("new", n)), type, 8, 99, 0, 3, 1, 0),
        CALL(PF_modify_col_def, (t, own, column(own, n)), type, 8, 1000, 0, 4, 0, 0),
        CALL(PF_modify_col_def, (t, own, column("new", n)), type, 8, 1000, 0, 3, 1, 0),
        CALL(PF_modify_col_def, (t, own, column("new", n)), type, 8, 1000, 0, 3, 1, 1),
      });
    }
    calls.insert(calls.end(), {
      CALL(PF_set_col_dft, ("t", column("x", n)), type, 8, 99, 0, 3, 0, 0),
      MORE(PF_set_col_dft, kPartStays, ("empty", column("x", n)), type, 8, 99, 0, 3, 0, 0),
      CALL(PF_inq_col_dft, ("t", n[0], HandedColumn().to()), type),
      CALL(validate_col_range, (at(column("x", n))), type, 8, 99, 0, 3, 0, 0),
      CALL(validate_col_def, (&table(), column("x", n)), type, 8, 99, 0, 3, 0, 0),
      CALL(construct_column, (Handed<TEVPF_COLUMN>{with<TEVPF_COLUMN>(column("x", n))}.to(), out,
                              out + 1, &short_out), type, 8, 99, 0, 3, 0, 0),
      CALL(calc_col_bytes, (n[0], long_text, out), type),
      CALL(adjust_col, (n[0], n[1], n[2], at(std::int16_t{0}), at(std::int16_t{4}),
                        at(TEVPF_COLUMN{}), out), 40, type, 8),
    });
  }
  calls.insert(calls.end(), {
    CALL(PF_delete_col, ("t", "string")), CALL(PF_move_col, ("t", "double", "int")),
    CALL(PF_move_col, ("t", "int", nullptr)),
    CALL(PF_inq_col_def, ("t", "string", HandedColumn().to())),
    CALL(PF_inq_col_def_by_pos, ("t", n[0], HandedColumn().to()), 1),
    CALL(PF_inq_col_names, ("t", out, Names().to())),
    CALL(PF_inq_col_offsets, ("t", out, Handed<std::int32_t*>().to())),
    CALL(load_col_dft, (&table("empty"))), CALL(get_col_type, ("t", "real", out)),
    CALL(get_col_ptr, (&table(), "real", &found_column)),
    CALL(check_unique_column, (&table(), "real")),
    CALL(check_unique_values, (&table(), table().col_array)),
    CALL(check_column_values, (&table(), 0, column("int", n), 0), PF_TYPE_INT, 8, 99, 0, 3, 0, 0),
    MORE(calc_col_width, kNoStatus, (n[0], n[1]), 5, 9),
    {"adjust_data", {}, [](Numbers) {
       PF_TRY(TEV8R1_get_table_ptr("t", &found_table));  // its copy shares no blocks
       TEVPF_TABLE alike = *found_table;
       alike.slots.bytes = std::int64_t{alike.num_rows} * alike.row_wid;
       alike.row_data = static_cast<unsigned char*>(std::malloc(std::size_t(alike.slots.bytes)));
       std::memcpy(alike.row_data, found_table->row_data, std::size_t(alike.slots.bytes));
       const TEVPF_STATUS status =
           TEV8R1_adjust_data(&alike, 4, alike.row_wid, 0, &alike.col_array->def);
       std::free(alike.row_data);
       return status;
     }},
    CALL(init_row_defaults, (&table())), CALL(create_index, (&table(), table().col_array)),
    {"sort_comp", {}, [](Numbers) {
       const TEVPF_STATUS status = TEV8R1_create_index(&table(), table().col_array);
       const std::int32_t* const index = table().col_array->idx_ptr;
       EXPECT_TRUE(status != PF_NORMAL || TEV8R1_sort_comp(index, index + 1) < 0);
       return status;
     }},
    {"update_indexes", {}, [](Numbers) {
       const TEVPF_STATUS status = TEV8R1_get_space(&table("empty"));
       return status == PF_NORMAL ? TEV8R1_update_indexes(&table("empty"), new_row(), 0) : status;
     }},
  });
}

void add_row_calls(std::vector<Call>& calls) {
  for (const char* t : {"t", "empty"}) {
    calls.insert(calls.end(), {
      CALL(PF_add_row, (t, new_row(n[0])), 999),
      CALL(PF_add_row_by_pos, (t, new_row(n[0]), n[1]), 999, 3),
      CALL(PF_add_row_with_dft, (t, new_row(), n), 1, 0, 0, 1, 0),
      CALL(PF_set_dft_row, (t, new_row(n[0])), 999), CALL(get_space, (&table(t))),
    });
  }
  calls.insert(calls.end(), {
    CALL(PF_replace_row, ("t", new_row(n[0])), 999), CALL(PF_delete_row, ("t")),
    {"PF_move_row", {1, 7}, [](Numbers n) {
       TEVPF_COLUMN* const search = table().cur_col;
       table().cur_col = nullptr;
       const TEVPF_STATUS status = TEV8R1_PF_move_row("t", n[0], n[1]);
       table().cur_col = search;
       return status;
     }},
    CALL(PF_get_next_row, ("t", row)), CALL(PF_get_row_by_pos, ("t", n[0], row), 2),
    CALL(PF_reset_table, ("t")), CALL(PF_inq_dft_row, ("t", row)),
    CALL(PF_get_col_values, ("t", "string", text_out)), CALL(PF_inq_num_rows, ("t", out)),
    CALL(PF_inq_table_info, ("t", out, out + 1, out + 2, out + 3, out + 4)),
    CALL(validate_row_value, ("t", "int", n), 5),
    CALL(validate_value, (&table(), table().col_array, n), 5), CALL(set_interactive_table, ("t")),
    CALL(turn_off_interactive, ()), CALL(PF_define_table_search, ("t", "int")),
    CALL(PF_get_row_by_value, ("t", std::int8_t(n[0]), "int", n + 1, row), 1, 20),
    CALL(PF_get_row_by_value, ("t", std::int8_t(n[0]), "string", "*", row), 1),
    CALL(PF_get_value, ("t", "double", n, row), 14), MORE(convert_row, kNoStatus, ("t", n[0]), 3),
    CALL(get_next_row_ptr, (&table(), &found_row, out)),
    CALL(get_cur_row_ptr, (&table(), &found_row, out)),
  });
}

void add_report_calls(std::vector<Call>& calls, const TempDir& dir) {
  static const char names[2][TEVPF_NAME_SIZE] = {"string", "real"};
  const std::string path = dir / "text";
  calls.insert(calls.end(), {
    CALL(PF_dump_file, (path.c_str())), CALL(PF_dump_list, ("list", path.c_str())),
    CALL(PF_dump_table, ("t", path.c_str())),
    CALL(PF_print_table, ("t", path.c_str(), n[0], n[1], names, n[2], n[3]), 1, 2, 0, PF_END_POS),
    CALL(print_table, (&table(), nowhere(), n[0], n[1], names, n[2], n[3]), 1, 2, 0, PF_END_POS),
    CALL(list_dump, (&list(), nowhere())), CALL(table_dump, (&table(), nowhere())),
    CALL(print_col_def, (nowhere(), table().col_array + 1)),
    CALL(display_string_value, (n[0], n[1], long_text, nowhere(), "  "), 1, 10),
    CALL(create_table_header, ("t", n[0], n[1], std::min(n[2], 20), std::min(n[3], 4000), out,
                               text_out), 0, 3, 2, 40),
    CALL(make_col_format, (at(with<TEVPF_COLUMN>(column("x", n))), out), PF_TYPE_DOUBLE, 8, 99, 0,
         3, 0, 0),
    CALL(make_table_format, (&table())),
    CALL(review_row, (table().col_array, table().col_array + 4, table().row_data, text_out, out)),
    CALL(remove_escape_chars, (at(std::int32_t(std::min(n[0], 8))),
                               Handed<char*>{strdup("\t\t\t\t\t\t\t")}.to()), 8),
    CALL(insert_escape_chars, (std::strcpy(text_out, "a\\tb"), out)),
  });
}
// clang-format on

// ---- What the rows work on -----------------------------------------------------------------------

void fill_list() {
  for (std::int32_t i = 0; i < 5; ++i) {
    const std::int32_t numbers[] = {PF_TYPE_INT + i, 1, 9, -9, 3};
    TEVPF_PARAM_DEF def = param(kNames[i], numbers);
    char value[] = "value", description[] = "about it";
    def.description = description;
    if (i == 2) def.part.str.value = value;
    ASSERT_EQ(TEV8R1_PF_add_param("list", &def, PF_END_POS), PF_NORMAL);
    ASSERT_EQ(TEV8R1_PF_set_param_dft("list", def), PF_NORMAL);
  }
  ASSERT_EQ(TEV8R1_set_cur_param("list", 1), PF_NORMAL);
}

void make_table(const char* name) {
  ASSERT_EQ(TEV8R1_PF_create_elem(name, "", PF_ELEM_TABLE), PF_NORMAL);
  for (const std::int32_t i : {0, 2, 1, 3, 4}) {
    const bool index = i == 0 || i == 2, unique = i == 0;
    const std::int32_t numbers[] = {PF_TYPE_INT + i, 8, unique ? 1000 : 99, 0, 3, index, unique};
    ASSERT_EQ(TEV8R1_PF_def_column(name, column(kNames[i], numbers)), PF_NORMAL);
  }
}

void fill_table() {
  for (std::int32_t i = 0; i < kRows; ++i) {
    ASSERT_EQ(TEV8R1_PF_add_row("t", new_row(7 * i % 10 + 10)), PF_NORMAL);
  }
  const std::int32_t numbers[] = {PF_TYPE_STRING, 8, 0, 0, 0, 0, 0};
  ASSERT_EQ(TEV8R1_PF_set_col_dft("t", column("x", numbers)), PF_NORMAL);
  ASSERT_EQ(TEV8R1_PF_define_table_search("t", "string"), PF_NORMAL);
  ASSERT_EQ(TEV8R1_PF_get_row_by_pos("t", 4, row), PF_NORMAL);
  ASSERT_EQ(TEV8R1_make_table_format(&table()), PF_NORMAL);
}

}  // namespace

void make_elements() {
  ASSERT_EQ(TEV8R1_PF_set_memory_allocation(5, kRows - 5), PF_NORMAL);
  for (int i = 0; i < 22; ++i) {
    const std::string name = i == 0 ? "list" : i == 1 ? "none" : std::to_string(i);
    ASSERT_EQ(TEV8R1_PF_create_elem(name.c_str(), "", PF_ELEM_LIST), PF_NORMAL);
  }
  fill_list();
  for (const char* name : {"t", "empty"}) make_table(name);
  fill_table();
}

std::vector<Call> all_calls(const TempDir& dir) {
  std::vector<Call> calls;
  for (const auto add :
       {add_element_calls, add_value_calls, add_list_calls, add_column_calls, add_row_calls}) {
    add(calls);
  }
  for (const auto add : {add_file_calls, add_report_calls}) add(calls, dir);
  return calls;
}
