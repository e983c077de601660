// The record of one open file, and what the chain of open files offers inside the library.
#pragma once

#include <cstdint>
#include <cstdio>

#include "core/base/heap.h"
#include "core/element.h"
#include "core/name_set.h"

extern "C" {

struct TEVPF_FILE {
  std::int32_t num_lists;
  std::int32_t num_tables;
  TEVPF_LIST** list_ptr;  // in directory order; owned, like the records
  TEVPF_TABLE** table_ptr;
  std::uint16_t free_lists;  // spare slots at the end of list_ptr
  std::uint16_t free_tables;
  TEVPF_FILE* next_file;
  TEVPF_LIST* last_list;  // the last one found by name, or null
  TEVPF_TABLE* last_table;
  std::FILE* fp;           // null once a save could not open the file again
  std::uint8_t new_file;   // created by this open and not saved since: deleted when closed unsaved
  std::uint8_t read_only;  // could only be opened for reading
  char file_name[TEVPF_FILE_NAME_SIZE];

  std::int32_t list_room;  // slots that the two arrays really have
  std::int32_t table_room;

  // Beside the directory, so that names are found and checked in O(1). Not used for elements of a kind
  // once a caller outside has appended a record of it, whose name the library does not learn.
  tevpf::NameSet list_names;
  tevpf::NameSet table_names;
  std::uint8_t lists_unhashed;
  std::uint8_t tables_unhashed;
};

TEVPF_API TEVPF_STATUS TEV8R1_add_file(std::FILE* stream, const char* name,
                                       std::uint8_t read_only) noexcept;
TEVPF_API TEVPF_STATUS TEV8R1_free_file(TEVPF_FILE* file) noexcept;
}

namespace tevpf {

// A record for a file of that name (at most TEVPF_FILE_NAME_SIZE - 1 characters) that is not yet in
// the chain; null when memory runs out.
[[nodiscard]] Owned<TEVPF_FILE> new_file_record(const char* name) noexcept;

// Puts a record at the end of the chain and makes it current.
TEVPF_FILE& append_file(Owned<TEVPF_FILE> record, std::FILE* stream, bool read_only) noexcept;

// Takes a file out of the chain; the current file becomes its neighbour.
void unlink_file(TEVPF_FILE& file) noexcept;

// The open file of exactly that name, or null.
[[nodiscard]] TEVPF_FILE* find_open_file(const char* name) noexcept;

// Whether the system refused access for lack of rights, or because nobody may write there.
[[nodiscard]] bool access_denied(int error_number) noexcept;

}  // namespace tevpf
