// The record of one open file, and the library's internal operations on the chain of open files.
#pragma once

#include <cstdint>
#include <cstdio>

#include "core/base/heap.h"
#include "core/element_kind.h"
#include "core/name_set.h"

namespace tevpf {

// The elements of one kind in one file.
struct Directory {
  std::int32_t count;
  std::int32_t room;            // allocated slots of `entries`
  TEVPF_ELEM_HEADER** entries;  // in directory order; owned, as are the records
  TEVPF_ELEM_HEADER* last;      // the last one found by name, or null
  std::uint16_t free_slots;     // spare slots beyond `count`, as counted when growing
  std::uint8_t is_unhashed;  // the library's caller appended a record and sets its name unnoticed
  NameSet names;             // finds and checks names in O(1)
};

}  // namespace tevpf

extern "C" {

struct TEVPF_FILE {
  tevpf::Directory directories[tevpf::kNumKinds];  // by type code - 1
  TEVPF_FILE* next_file;
  std::FILE* fp;           // null if a save could not reopen the file
  std::uint8_t new_file;   // created by this open and not saved since: deleted when closed unsaved
  std::uint8_t read_only;  // could only be opened for reading
  char file_name[TEVPF_FILE_NAME_SIZE];
};

TEVPF_API TEVPF_STATUS TEV8R1_add_file(std::FILE* stream, const char* name,
                                       std::uint8_t read_only) noexcept;
TEVPF_API TEVPF_STATUS TEV8R1_free_file(TEVPF_FILE* file) noexcept;
}

namespace tevpf {

inline Directory& directory_of(TEVPF_FILE& file, std::int32_t elem_type) noexcept {
  return file.directories[elem_type - 1];
}
inline const Directory& directory_of(const TEVPF_FILE& file, std::int32_t elem_type) noexcept {
  return file.directories[elem_type - 1];
}

// A new record, not yet in the chain, for a file of that name (at most TEVPF_FILE_NAME_SIZE - 1
// characters); null when out of memory.
[[nodiscard]] Owned<TEVPF_FILE> new_file_record(const char* name) noexcept;

// Appends a record to the chain and makes its file current.
TEVPF_FILE& append_file(Owned<TEVPF_FILE> record, std::FILE* stream, bool read_only) noexcept;

// Removes a file from the chain. Its predecessor becomes current, or the first file if it has none.
void unlink_file(TEVPF_FILE& file) noexcept;

// The open file of exactly that name, or null.
[[nodiscard]] TEVPF_FILE* find_open_file(const char* name) noexcept;

// Whether the system denied access for lack of permission or because the file system is read-only.
[[nodiscard]] bool access_denied(int error_number) noexcept;

}  // namespace tevpf
