// Debug output shared by the dumps of lists and tables.
#pragma once

#include <cstdint>

#include "reports/text_out.h"

namespace tevpf {

// Writes the entries of an index, two per line.
inline void write_index_entries(TextOut& out, const std::int32_t* entries,
                                std::int32_t count) noexcept {
  for (std::int32_t i = 0; i < count; ++i) {
    out.print(i, ".  ", entries[i]);
    if (i % 2 == 0 && i + 1 < count) {
      out.print("        ");
    } else {
      out.print('\n');
    }
  }
}

// Writes the address of a block.
inline std::uintptr_t address_of(const void* block) noexcept {
  return reinterpret_cast<std::uintptr_t>(block);
}

}  // namespace tevpf
