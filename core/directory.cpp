#include "core/directory.h"

#include <cstring>

#include "core/base/heap.h"
#include "core/base/status.h"

namespace tevpf {
namespace {

constexpr std::int32_t kDirectoryStep = 100;  // slots added when a directory is full
constexpr std::int32_t kWorthHashing = 16;    // number of elements from which names are hashed

Directory& current_directory(std::int32_t elem_type) noexcept {
  return directory_of(*library.current_file, elem_type);
}

// Whether the name set matches the directory; rebuilds it if not. Small directories are scanned
// instead.
bool names_are_hashed(Directory& directory) noexcept {
  NameSet& names = directory.names;
  if (directory.count < kWorthHashing || directory.is_unhashed != 0) return false;
  if (names.count == directory.count) return true;
  drop_names(names);
  for (std::int32_t i = 0; i < directory.count && names.count == i; ++i) {
    add_name(names, directory.entries[i]);
  }
  return names.count == directory.count;
}

// The element whose name has the same first 19 characters, or null.
TEVPF_ELEM_HEADER* find_kept_name(Directory& directory, const char* name) noexcept {
  if (names_are_hashed(directory)) return find_name(directory.names, name);
  for (std::int32_t i = 0; i < directory.count; ++i) {
    TEVPF_ELEM_HEADER* const element = directory.entries[i];
    if (same_element_name(element->elem_name, name)) return element;
  }
  return nullptr;
}

// Ensures a free slot; false when out of memory.
bool make_slot(Directory& directory) noexcept {
  if (directory.free_slots != 0) return true;
  const std::int64_t needed = std::int64_t{directory.count} + kDirectoryStep;
  if (needed > INT32_MAX) return false;
  if (directory.room < needed) {
    const std::int64_t larger = grown_room(directory.room, needed);
    auto& entries = directory.entries;
    void* block = heap_resize(entries, static_cast<std::uint64_t>(larger), sizeof *entries);
    if (block == nullptr) return false;
    entries = static_cast<TEVPF_ELEM_HEADER**>(block);
    directory.room = static_cast<std::int32_t>(larger < INT32_MAX ? larger : INT32_MAX);
  }
  directory.free_slots = kDirectoryStep;
  return true;
}

void append(Directory& directory, TEVPF_ELEM_HEADER* element) noexcept {
  directory.entries[directory.count++] = element;
  --directory.free_slots;
}

// Adds the name of an element that was just appended to the name set, if that is in use.
void hash_new_name(Directory& directory, TEVPF_ELEM_HEADER* element) noexcept {
  NameSet& names = directory.names;
  if (names.count == directory.count - 1 && names.slots != nullptr) add_name(names, element);
}

// A zeroed record that belongs to no directory yet.
Owned<unsigned char> new_record(std::int32_t elem_type) noexcept {
  return new_zeroed<unsigned char>(kind_of(elem_type).record_size);
}

TEVPF_ELEM_HEADER* header_of(unsigned char* record) noexcept {
  return reinterpret_cast<TEVPF_ELEM_HEADER*>(record);
}

TEVPF_STATUS insert_record(std::int32_t elem_type, TEVPF_ELEM_HEADER*& element) noexcept {
  if (library.current_file == nullptr) return fail_empty(PF_NOFILE);
  Owned<unsigned char> record = new_record(elem_type);
  if (!record || !make_slot(current_directory(elem_type))) return fail_empty(PF_NOMEM);
  element = header_of(record.release());
  append(current_directory(elem_type), element);
  return PF_NORMAL;
}

TEVPF_STATUS rename_element(std::int32_t elem_type, const char* old_name,
                            const char* new_name) noexcept {
  TEVPF_ELEM_HEADER* element = nullptr;
  PF_TRY(check_name_unique(elem_type, new_name));
  PF_TRY(find_element(elem_type, old_name, element));
  NameSet& names = current_directory(elem_type).names;
  const bool hashed = names.slots != nullptr;
  if (hashed) remove_name(names, element);
  set_field(element->elem_name, new_name);
  if (hashed) add_name(names, element);
  return PF_NORMAL;
}

TEVPF_STATUS bad_element_type(const char* item, std::int32_t elem_type) noexcept {
  return fail(PF_BADTYPE, item, Text(elem_type));
}

}  // namespace

TEVPF_STATUS find_element(std::int32_t elem_type, const char* name,
                          TEVPF_ELEM_HEADER*& element) noexcept {
  if (library.current_file == nullptr) return fail_empty(PF_NOFILE);
  Directory& directory = current_directory(elem_type);
  TEVPF_ELEM_HEADER*& last = directory.last;
  if (last == nullptr || std::strcmp(last->elem_name, name) != 0) {
    TEVPF_ELEM_HEADER* const found = find_kept_name(directory, name);
    // A name longer than the kept characters does not match.
    if (found == nullptr || std::strcmp(found->elem_name, name) != 0) {
      return fail(PF_NOELEM, kind_of(elem_type).word, name);
    }
    last = found;
  }
  element = last;
  return PF_NORMAL;
}

TEVPF_STATUS element_position(std::int32_t elem_type, const TEVPF_ELEM_HEADER* element,
                              std::int32_t& position) noexcept {
  if (library.current_file == nullptr) return PF_NOELEM;
  const Directory& directory = current_directory(elem_type);
  for (std::int32_t i = 0; i < directory.count; ++i) {
    if (directory.entries[i] == element) {
      position = i;
      return PF_NORMAL;
    }
  }
  return PF_NOELEM;
}

TEVPF_STATUS check_name_unique(std::int32_t elem_type, const char* name) noexcept {
  if (library.current_file == nullptr) return fail_empty(PF_NOFILE);
  if (find_kept_name(current_directory(elem_type), name) == nullptr) return PF_NORMAL;
  return fail(PF_DUPLICATE, {kind_of(elem_type).lead, name}, "the file");
}

TEVPF_STATUS create_element(TEVPF_ELEM_HEADER header, std::int32_t elem_type,
                            TEVPF_ELEM_HEADER*& element) noexcept {
  terminate_field(header.elem_name);
  terminate_field(header.elem_desc);
  PF_TRY(check_name_unique(elem_type, header.elem_name));
  PF_TRY(insert_record(elem_type, element));
  *element = header;
  kind_of(elem_type).start(*element);
  hash_new_name(current_directory(elem_type), element);
  return PF_NORMAL;
}

TEVPF_STATUS insert_unnamed(std::int32_t elem_type, TEVPF_ELEM_HEADER*& element) noexcept {
  PF_TRY(insert_record(elem_type, element));
  Directory& directory = current_directory(elem_type);
  directory.is_unhashed = 1;
  drop_names(directory.names);
  return PF_NORMAL;
}

TEVPF_STATUS delete_element(std::int32_t elem_type, const char* name) noexcept {
  TEVPF_ELEM_HEADER* element = nullptr;
  std::int32_t pos = 0;
  PF_TRY(find_element(elem_type, name, element));
  PF_TRY(element_position(elem_type, element, pos));
  Directory& directory = current_directory(elem_type);
  TEVPF_ELEM_HEADER** const slot = directory.entries + pos;
  const std::int32_t behind = --directory.count - pos;
  std::memmove(slot, slot + 1, static_cast<std::size_t>(behind) * sizeof *slot);
  directory.last = nullptr;
  remove_name(directory.names, element);
  kind_of(elem_type).release(element);
  return PF_NORMAL;
}

// The copy is complete before it enters the directory.
TEVPF_STATUS copy_element(std::int32_t elem_type, const char* source_name,
                          const char* new_name) noexcept {
  TEVPF_ELEM_HEADER* source = nullptr;
  PF_TRY(find_element(elem_type, source_name, source));
  if (starts_with_blank(new_name)) return PF_BADNAME;
  PF_TRY(check_name_unique(elem_type, new_name));

  const ElementKind& kind = kind_of(elem_type);
  Directory& directory = current_directory(elem_type);
  Owned<unsigned char> record = new_record(elem_type);
  if (!record) return fail_empty(PF_NOMEM);
  TEVPF_ELEM_HEADER* const copy = header_of(record.get());
  *copy = *source;
  set_field(copy->elem_name, new_name);
  kind.start(*copy);
  if (!kind.copy(*source, *copy)) return fail_empty(PF_NOMEM);
  (void)record.release();
  if (!make_slot(directory)) {
    kind.release(copy);
    return fail_empty(PF_NOMEM);
  }
  append(directory, copy);
  hash_new_name(directory, copy);
  return PF_NORMAL;
}

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_PF_create_elem(const char* name, const char* description,
                                   std::int32_t elem_type) noexcept {
  if (library.current_file == nullptr) return fail_empty(PF_NOFILE);
  if (starts_with_blank(name)) return fail_empty(PF_BADNAME);
  if (!is_element_type(elem_type)) return bad_element_type("function call ", elem_type);
  TEVPF_ELEM_HEADER header = {};
  header.elem_type = elem_type;
  header.btf = kind_of(elem_type).smallest_body;
  set_field(header.elem_name, name);
  set_field(header.elem_desc, description);
  TEVPF_ELEM_HEADER* element = nullptr;
  PF_TRY(create_element(header, elem_type, element));
  return kind_of(elem_type).reserve(*element) ? TEVPF_STATUS{PF_NORMAL} : fail_empty(PF_NOMEM);
}

TEVPF_STATUS TEV8R1_modify_elem_name(std::int32_t elem_type, const char* old_name,
                                     const char* new_name) noexcept {
  if (same_element_name(old_name, new_name)) return PF_NORMAL;
  if (starts_with_blank(new_name)) return fail_empty(PF_BADNAME);
  if (library.current_file == nullptr) return fail_empty(PF_NOFILE);
  if (!is_element_type(elem_type)) return bad_element_type("function call", elem_type);
  return rename_element(elem_type, old_name, new_name);
}

TEVPF_STATUS TEV8R1_modify_elem_desc(std::int32_t elem_type, const char* name,
                                     const char* description) noexcept {
  if (!is_element_type(elem_type)) return bad_element_type("function call", elem_type);
  TEVPF_ELEM_HEADER* element = nullptr;
  PF_TRY(find_element(elem_type, name, element));
  set_field(element->elem_desc, description);
  return PF_NORMAL;
}
