// The process-wide state of the library.
#pragma once

#include <cstdint>

#include "core/element.h"

namespace tevpf {

inline constexpr std::int32_t kDefaultInitial = 25;
inline constexpr std::int32_t kDefaultIncrement = 10;

struct Library {
  std::int32_t num_files;
  TEVPF_FILE* first_file;  // the open files, chained in the order in which they were opened
  TEVPF_FILE* last_file;
  TEVPF_FILE* current_file;      // the file that element operations use
  std::int32_t interactive;      // 1: rows are stored without value checks
  const char* debug_value;       // if not null, dumps show internal fields
  std::int32_t alloc_initial;    // slots of a new parameter array or row storage
  std::int32_t alloc_increment;  // slots added when they are full
  std::uint8_t init_done;
  std::int32_t dup_row;  // row number of the last duplicate that a value check found
};

extern Library library;

}  // namespace tevpf
