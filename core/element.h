// The header that starts every element record, in memory and in the file.
#pragma once

#include <cstdint>

#include "include/tevpf.h"

extern "C" {

struct TEVPF_ELEM_HEADER {
  std::int32_t elem_type;           // PF_ELEM_LIST or PF_ELEM_TABLE
  char elem_name[TEVPF_NAME_SIZE];  // zero-filled after the terminator
  char elem_desc[TEVPF_DESC_SIZE];  // likewise
  std::int32_t btf;                 // bytes to follow: size of the stored body after this header
};
static_assert(sizeof(TEVPF_ELEM_HEADER) == 108);

struct TEVPF_FILE;
}
