// The chain of open files, and inquiries about the current one.
#include "core/file.h"

#include <cerrno>
#include <cstring>

#include "core/base/status.h"
#include "core/base/text_field.h"
#include "core/library.h"

namespace tevpf {

Owned<TEVPF_FILE> new_file_record(const char* name) noexcept {
  Owned<TEVPF_FILE> record = new_zeroed<TEVPF_FILE>(1);
  if (record) set_field(record[0].file_name, name);
  return record;
}

TEVPF_FILE& append_file(Owned<TEVPF_FILE> record, std::FILE* stream, bool read_only) noexcept {
  TEVPF_FILE* file = record.release();
  file->fp = stream;
  file->read_only = read_only ? 1 : 0;
  (library.first_file == nullptr ? library.first_file : library.last_file->next_file) = file;
  library.last_file = file;
  library.current_file = file;
  ++library.num_files;
  return *file;
}

void unlink_file(TEVPF_FILE& file) noexcept {
  TEVPF_FILE* before = nullptr;
  for (TEVPF_FILE* f = library.first_file; f != &file; f = f->next_file) before = f;
  (before == nullptr ? library.first_file : before->next_file) = file.next_file;
  if (library.last_file == &file) library.last_file = before;
  library.current_file = before != nullptr ? before : library.first_file;
  --library.num_files;
}

TEVPF_FILE* find_open_file(const char* name) noexcept {
  TEVPF_FILE* file = library.first_file;
  while (file != nullptr && std::strcmp(file->file_name, name) != 0) file = file->next_file;
  return file;
}

bool access_denied(int error_number) noexcept {
  return error_number == EACCES || error_number == EROFS;
}

namespace {

// Returns names and descriptions of elements in new arrays that the caller owns.
TEVPF_STATUS hand_out_elements(const Directory& directory, char (**names_out)[TEVPF_NAME_SIZE],
                               char (**descs_out)[TEVPF_DESC_SIZE]) noexcept {
  if (directory.count <= 0) return PF_NORMAL;
  const auto slots = static_cast<std::uint64_t>(directory.count);
  auto* names = static_cast<char(*)[TEVPF_NAME_SIZE]>(heap_zeroed(slots, TEVPF_NAME_SIZE));
  if (names == nullptr) return fail_empty(PF_NOMEM);
  *names_out = names;
  auto* descs = static_cast<char(*)[TEVPF_DESC_SIZE]>(heap_zeroed(slots, TEVPF_DESC_SIZE));
  if (descs == nullptr) return fail_empty(PF_NOMEM);
  *descs_out = descs;
  for (std::int32_t i = 0; i < directory.count; ++i) {
    set_field(names[i], directory.entries[i]->elem_name);
    set_field(descs[i], directory.entries[i]->elem_desc);
  }
  return PF_NORMAL;
}

void release_elements(Directory& directory, const ElementKind& kind) noexcept {
  for (std::int32_t i = 0; i < directory.count; ++i) kind.release(directory.entries[i]);
  drop_names(directory.names);
  heap_free(directory.entries);
}

}  // namespace

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_add_file(std::FILE* stream, const char* name, std::uint8_t read_only) noexcept {
  if (std::strlen(name) >= TEVPF_FILE_NAME_SIZE) return fail(PF_OPENFAIL, name);
  Owned<TEVPF_FILE> record = new_file_record(name);
  if (!record) return fail_empty(PF_NOMEM);
  TEVPF_FILE& file = append_file(std::move(record), stream, false);
  file.read_only = read_only;
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_free_file(TEVPF_FILE* file) noexcept {
  for (std::int32_t type = 1; type <= kNumKinds; ++type) {
    release_elements(directory_of(*file, type), kind_of(type));
  }
  heap_free(file);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_change_file(const char* name) noexcept {
  clear_error_context();
  TEVPF_FILE* file = find_open_file(name);
  if (file == nullptr) return PF_NOFILE;
  library.current_file = file;
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_inq_current_file(char* name_out) noexcept {
  clear_error_context();
  if (library.current_file == nullptr) return PF_NOFILE;
  std::strcpy(name_out, library.current_file->file_name);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_inq_file_access(std::int32_t* access_out) noexcept {
  if (library.current_file == nullptr) return fail_empty(PF_NOFILE);
  *access_out = library.current_file->read_only != 0 ? 0 : 1;
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_inq_file_elements(char* file_name_out, std::int32_t* num_lists_out,
                                         char (**list_names_out)[TEVPF_NAME_SIZE],
                                         char (**list_descs_out)[TEVPF_DESC_SIZE],
                                         std::int32_t* num_tables_out,
                                         char (**table_names_out)[TEVPF_NAME_SIZE],
                                         char (**table_descs_out)[TEVPF_DESC_SIZE]) noexcept {
  const TEVPF_FILE* file = library.current_file;
  if (file == nullptr) return fail_empty(PF_NOFILE);
  std::strcpy(file_name_out, file->file_name);
  const Directory& lists = directory_of(*file, PF_ELEM_LIST);
  *num_lists_out = lists.count;
  PF_TRY(hand_out_elements(lists, list_names_out, list_descs_out));
  const Directory& tables = directory_of(*file, PF_ELEM_TABLE);
  *num_tables_out = tables.count;
  return hand_out_elements(tables, table_names_out, table_descs_out);
}
