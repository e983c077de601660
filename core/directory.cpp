// The directory of the current file. Lists and tables go by the same rules, so that every operation
// is written once, over what Kind says of each.
#include "core/directory.h"

#include <cstring>

#include "core/base/heap.h"
#include "core/base/status.h"
#include "core/base/text_field.h"
#include "core/file.h"
#include "core/library.h"
#include "lists/list.h"
#include "tables/table.h"

namespace tevpf {

namespace {

constexpr std::int32_t kDirectoryStep = 100;  // slots added when a directory is full
constexpr std::int32_t kWorthHashing = 16;    // elements from which on names are hashed

// A kind of element: its record, its part of the file's record, and its words.
template <class Record>
struct Kind;

template <>
struct Kind<TEVPF_LIST> {
  static constexpr const char* kWord = "list";
  static constexpr const char* kLead = "list ";
  static constexpr auto kCount = &TEVPF_FILE::num_lists;
  static constexpr auto kEntries = &TEVPF_FILE::list_ptr;
  static constexpr auto kFree = &TEVPF_FILE::free_lists;
  static constexpr auto kRoom = &TEVPF_FILE::list_room;
  static constexpr auto kLast = &TEVPF_FILE::last_list;
  static constexpr auto kNames = &TEVPF_FILE::list_names;
  static constexpr auto kUnhashed = &TEVPF_FILE::lists_unhashed;

  static void start(TEVPF_LIST& list) noexcept { list.cur_param = -1; }
  static void release(TEVPF_LIST* list) noexcept { release_list(list); }
  static bool copy_body(const TEVPF_LIST& source, TEVPF_LIST& copy) noexcept {
    return copy_list_body(source, copy);
  }
};

template <>
struct Kind<TEVPF_TABLE> {
  static constexpr const char* kWord = "table";
  static constexpr const char* kLead = "table ";
  static constexpr auto kCount = &TEVPF_FILE::num_tables;
  static constexpr auto kEntries = &TEVPF_FILE::table_ptr;
  static constexpr auto kFree = &TEVPF_FILE::free_tables;
  static constexpr auto kRoom = &TEVPF_FILE::table_room;
  static constexpr auto kLast = &TEVPF_FILE::last_table;
  static constexpr auto kNames = &TEVPF_FILE::table_names;
  static constexpr auto kUnhashed = &TEVPF_FILE::tables_unhashed;

  static void start(TEVPF_TABLE& table) noexcept { table.cur_row = -1; }
  static void release(TEVPF_TABLE* table) noexcept { release_table(table); }
  static bool copy_body(const TEVPF_TABLE& source, TEVPF_TABLE& copy) noexcept {
    return copy_table_body(source, copy);
  }
};

// Whether the hashed names are those of the directory; builds them when they are not. A directory
// of a few elements is walked instead.
template <class Record>
bool names_are_hashed(TEVPF_FILE& file) noexcept {
  const std::int32_t count = file.*Kind<Record>::kCount;
  NameSet& names = file.*Kind<Record>::kNames;
  if (count < kWorthHashing || file.*Kind<Record>::kUnhashed != 0) return false;
  if (names.count == count) return true;
  drop_names(names);
  for (std::int32_t i = 0; i < count && names.count == i; ++i) {
    add_name(names, &(file.*Kind<Record>::kEntries)[i]->header);
  }
  return names.count == count;
}

// The element whose name has the same first 19 characters, or null.
template <class Record>
Record* find_kept_name(TEVPF_FILE& file, const char* name) noexcept {
  if (names_are_hashed<Record>(file)) {
    // A record starts with its header.
    return reinterpret_cast<Record*>(find_name(file.*Kind<Record>::kNames, name));
  }
  for (std::int32_t i = 0; i < file.*Kind<Record>::kCount; ++i) {
    Record* element = (file.*Kind<Record>::kEntries)[i];
    if (same_element_name(element->header.elem_name, name)) return element;
  }
  return nullptr;
}

template <class Record>
[[gnu::noinline]] TEVPF_STATUS find_in_directory(const char* name, Record** element_out) noexcept {
  if (library.current_file == nullptr) return fail_empty(PF_NOFILE);
  TEVPF_FILE& file = *library.current_file;
  Record*& last = file.*Kind<Record>::kLast;
  if (last == nullptr || std::strcmp(last->header.elem_name, name) != 0) {
    Record* found = find_kept_name<Record>(file, name);
    // A longer name is not the one that is kept of it.
    if (found == nullptr || std::strcmp(found->header.elem_name, name) != 0) {
      return fail(PF_NOELEM, Kind<Record>::kWord, name);
    }
    last = found;
  }
  *element_out = last;
  return PF_NORMAL;
}

// Every operation starts here, and mostly with the element of the last one and a short name: that
// case calls nothing.
template <class Record>
Record* last_element(const char* name) noexcept {
  if (library.current_file == nullptr) return nullptr;
  Record* const last = library.current_file->*Kind<Record>::kLast;
  return last != nullptr && holds_short_text(last->header.elem_name, name) ? last : nullptr;
}

template <class Record>
TEVPF_STATUS find_element(const char* name, Record** element_out) noexcept {
  if (Record* const last = last_element<Record>(name)) {
    *element_out = last;
    return PF_NORMAL;
  }
  return find_in_directory(name, element_out);
}

template <class Record>
TEVPF_STATUS check_unique(const char* name) noexcept {
  if (library.current_file == nullptr) return fail_empty(PF_NOFILE);
  if (find_kept_name<Record>(*library.current_file, name) == nullptr) return PF_NORMAL;
  return fail(PF_DUPLICATE, {Kind<Record>::kLead, name}, "the file");
}

// Makes sure of a free slot; false when memory runs out.
template <class Record>
bool make_slot(TEVPF_FILE& file) noexcept {
  if (file.*Kind<Record>::kFree != 0) return true;
  const std::int64_t needed = std::int64_t{file.*Kind<Record>::kCount} + kDirectoryStep;
  if (needed > INT32_MAX) return false;
  std::int32_t& room = file.*Kind<Record>::kRoom;
  if (room < needed) {
    const std::int64_t larger = grown_room(room, needed);
    auto& entries = file.*Kind<Record>::kEntries;
    void* block = heap_resize(entries, static_cast<std::uint64_t>(larger), sizeof *entries);
    if (block == nullptr) return false;
    entries = static_cast<Record**>(block);
    room = static_cast<std::int32_t>(larger < INT32_MAX ? larger : INT32_MAX);
  }
  file.*Kind<Record>::kFree = kDirectoryStep;
  return true;
}

template <class Record>
void append(TEVPF_FILE& file, Record* element) noexcept {
  (file.*Kind<Record>::kEntries)[(file.*Kind<Record>::kCount)++] = element;
  --(file.*Kind<Record>::kFree);
}

// Keeps names that are hashed in step with an element that was appended and has got its name.
template <class Record>
void hash_new_name(TEVPF_FILE& file, Record* element) noexcept {
  NameSet& names = file.*Kind<Record>::kNames;
  if (names.count == file.*Kind<Record>::kCount - 1 && names.slots != nullptr) {
    add_name(names, &element->header);
  }
}

template <class Record>
TEVPF_STATUS insert_element(Record** element_out) noexcept {
  if (library.current_file == nullptr) return fail_empty(PF_NOFILE);
  Owned<Record> element = new_zeroed<Record>(1);
  if (!element || !make_slot<Record>(*library.current_file)) return fail_empty(PF_NOMEM);
  *element_out = element.release();
  append(*library.current_file, *element_out);
  return PF_NORMAL;
}

// The same for a caller outside, who gives the record its name afterwards.
template <class Record>
TEVPF_STATUS insert_unnamed(Record** element_out) noexcept {
  PF_TRY(insert_element(element_out));
  library.current_file->*Kind<Record>::kUnhashed = 1;
  drop_names(library.current_file->*Kind<Record>::kNames);
  return PF_NORMAL;
}

template <class Record>
TEVPF_STATUS create_element(TEVPF_ELEM_HEADER header, Record** element_out) noexcept {
  terminate_field(header.elem_name);
  terminate_field(header.elem_desc);
  PF_TRY(check_unique<Record>(header.elem_name));
  PF_TRY(insert_element(element_out));
  (*element_out)->header = header;
  Kind<Record>::start(**element_out);
  hash_new_name(*library.current_file, *element_out);
  return PF_NORMAL;
}

template <class Record>
TEVPF_STATUS rename_element(const char* old_name, const char* new_name) noexcept {
  Record* element = nullptr;
  PF_TRY(check_unique<Record>(new_name));
  PF_TRY(find_element(old_name, &element));
  NameSet& names = library.current_file->*Kind<Record>::kNames;
  const bool hashed = names.slots != nullptr;
  if (hashed) remove_name(names, &element->header);
  set_field(element->header.elem_name, new_name);
  if (hashed) add_name(names, &element->header);
  return PF_NORMAL;
}

template <class Record>
TEVPF_STATUS describe_element(const char* name, const char* description) noexcept {
  Record* element = nullptr;
  PF_TRY(find_element(name, &element));
  set_field(element->header.elem_desc, description);
  return PF_NORMAL;
}

template <class Record>
TEVPF_STATUS position_of(const Record* element, std::int32_t* pos_out) noexcept {
  if (library.current_file == nullptr) return PF_NOELEM;
  const TEVPF_FILE& file = *library.current_file;
  for (std::int32_t i = 0; i < file.*Kind<Record>::kCount; ++i) {
    if ((file.*Kind<Record>::kEntries)[i] == element) {
      *pos_out = i;
      return PF_NORMAL;
    }
  }
  return PF_NOELEM;
}

template <class Record>
TEVPF_STATUS delete_element(const char* name) noexcept {
  Record* element = nullptr;
  PF_TRY(find_element(name, &element));
  std::int32_t pos = 0;
  PF_TRY(position_of(element, &pos));
  TEVPF_FILE& file = *library.current_file;
  Record** slot = file.*Kind<Record>::kEntries + pos;
  const std::int32_t behind = --(file.*Kind<Record>::kCount) - pos;
  std::memmove(slot, slot + 1, static_cast<std::size_t>(behind) * sizeof *slot);
  file.*Kind<Record>::kLast = nullptr;
  remove_name(file.*Kind<Record>::kNames, &element->header);
  Kind<Record>::release(element);
  return PF_NORMAL;
}

// The copy is whole before it is put into the directory.
template <class Record>
TEVPF_STATUS copy_element(const char* source_name, const char* new_name) noexcept {
  Record* source = nullptr;
  PF_TRY(find_element(source_name, &source));
  if (starts_with_blank(new_name)) return PF_BADNAME;
  PF_TRY(check_unique<Record>(new_name));

  TEVPF_FILE& file = *library.current_file;
  Owned<Record> copy = new_zeroed<Record>(1);
  if (!copy) return fail_empty(PF_NOMEM);
  copy[0].header = source->header;
  set_field(copy[0].header.elem_name, new_name);
  Kind<Record>::start(copy[0]);
  if (!Kind<Record>::copy_body(*source, copy[0])) return fail_empty(PF_NOMEM);
  if (!make_slot<Record>(file)) {
    Kind<Record>::release(copy.release());
    return fail_empty(PF_NOMEM);
  }
  append(file, copy.get());
  hash_new_name(file, copy.release());
  return PF_NORMAL;
}

TEVPF_STATUS create_list_with_room(TEVPF_ELEM_HEADER header) noexcept {
  TEVPF_LIST* list = nullptr;
  header.btf = kListHead;
  PF_TRY(TEV8R1_create_list(header, &list));
  if (!reserve_first_params(*list, library.alloc_initial)) return fail_empty(PF_NOMEM);
  return PF_NORMAL;
}

TEVPF_STATUS bad_element_type(const char* item, std::int32_t elem_type) noexcept {
  return fail(PF_BADTYPE, item, Text(elem_type));
}

}  // namespace

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_PF_create_elem(const char* name, const char* description,
                                   std::int32_t elem_type) noexcept {
  if (library.current_file == nullptr) return fail_empty(PF_NOFILE);
  if (starts_with_blank(name)) return fail_empty(PF_BADNAME);
  TEVPF_ELEM_HEADER header = {};
  header.elem_type = elem_type;
  set_field(header.elem_name, name);
  set_field(header.elem_desc, description);
  if (elem_type == PF_ELEM_LIST) return create_list_with_room(header);
  if (elem_type != PF_ELEM_TABLE) return bad_element_type("function call ", elem_type);
  TEVPF_TABLE* table = nullptr;
  header.btf = kTableHead;
  return TEV8R1_create_table(header, &table);
}

TEVPF_STATUS TEV8R1_modify_elem_name(std::int32_t elem_type, const char* old_name,
                                     const char* new_name) noexcept {
  if (same_element_name(old_name, new_name)) return PF_NORMAL;
  if (starts_with_blank(new_name)) return fail_empty(PF_BADNAME);
  if (library.current_file == nullptr) return fail_empty(PF_NOFILE);
  if (elem_type == PF_ELEM_LIST) return rename_element<TEVPF_LIST>(old_name, new_name);
  if (elem_type == PF_ELEM_TABLE) return rename_element<TEVPF_TABLE>(old_name, new_name);
  return bad_element_type("function call", elem_type);
}

TEVPF_STATUS TEV8R1_modify_elem_desc(std::int32_t elem_type, const char* name,
                                     const char* description) noexcept {
  if (elem_type == PF_ELEM_LIST) return describe_element<TEVPF_LIST>(name, description);
  if (elem_type == PF_ELEM_TABLE) return describe_element<TEVPF_TABLE>(name, description);
  return bad_element_type("function call", elem_type);
}

TEVPF_STATUS TEV8R1_create_list(TEVPF_ELEM_HEADER header, TEVPF_LIST** list_out) noexcept {
  return create_element(header, list_out);
}

TEVPF_STATUS TEV8R1_create_table(TEVPF_ELEM_HEADER header, TEVPF_TABLE** table_out) noexcept {
  return create_element(header, table_out);
}

TEVPF_STATUS TEV8R1_insert_list(TEVPF_LIST** list_out) noexcept { return insert_unnamed(list_out); }

TEVPF_STATUS TEV8R1_insert_table(TEVPF_TABLE** table_out) noexcept {
  return insert_unnamed(table_out);
}

TEVPF_LIST* tevpf::last_list(const char* name) noexcept { return last_element<TEVPF_LIST>(name); }
TEVPF_TABLE* tevpf::last_table(const char* name) noexcept {
  return last_element<TEVPF_TABLE>(name);
}

TEVPF_STATUS TEV8R1_get_list_ptr(const char* name, TEVPF_LIST** list_out) noexcept {
  return find_element(name, list_out);
}

TEVPF_STATUS TEV8R1_get_table_ptr(const char* name, TEVPF_TABLE** table_out) noexcept {
  return find_element(name, table_out);
}

TEVPF_STATUS TEV8R1_get_list_array_pos(const TEVPF_LIST* list, std::int32_t* pos_out) noexcept {
  return position_of(list, pos_out);
}

TEVPF_STATUS TEV8R1_get_table_array_pos(const TEVPF_TABLE* table, std::int32_t* pos_out) noexcept {
  return position_of(table, pos_out);
}

TEVPF_STATUS TEV8R1_check_list_unique(const char* name) noexcept {
  return check_unique<TEVPF_LIST>(name);
}

TEVPF_STATUS TEV8R1_check_table_unique(const char* name) noexcept {
  return check_unique<TEVPF_TABLE>(name);
}

TEVPF_STATUS TEV8R1_PF_delete_list(const char* name) noexcept {
  return delete_element<TEVPF_LIST>(name);
}

TEVPF_STATUS TEV8R1_PF_delete_table(const char* name) noexcept {
  return delete_element<TEVPF_TABLE>(name);
}

TEVPF_STATUS TEV8R1_free_list(TEVPF_LIST* list) noexcept {
  release_list(list);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_free_table(TEVPF_TABLE* table) noexcept {
  release_table(table);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_copy_list(const char* source_name, const char* new_name) noexcept {
  return copy_element<TEVPF_LIST>(source_name, new_name);
}

TEVPF_STATUS TEV8R1_PF_copy_table(const char* source_name, const char* new_name) noexcept {
  return copy_element<TEVPF_TABLE>(source_name, new_name);
}
