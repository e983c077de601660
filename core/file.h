// The record of one open file, and what the chain of open files offers inside the library.
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
  std::int32_t room;            // slots that `entries` really has
  TEVPF_ELEM_HEADER** entries;  // in directory order; owned, like the records
  TEVPF_ELEM_HEADER* last;      // the last one found by name, or null
  std::uint16_t free_slots;     // slots beyond `count` that growing has counted
  std::uint8_t is_unhashed;  // a caller outside has appended a record and names it without telling
  NameSet names;             // beside the entries, so that names are found and checked in O(1)
};

}  // namespace tevpf

extern "C" {

struct TEVPF_FILE {
  tevpf::Directory directories[tevpf::kNumKinds];  // by type code - 1
  TEVPF_FILE* next_file;
  std::FILE* fp;           // null once a save could not open the file again
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
