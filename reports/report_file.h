// The text file that a report goes to.
#pragma once

#include <cstdio>

#include "core/status.h"
#include "reports/text_out.h"

namespace tevpf {

// Creates or empties the file, lets `body` write to it, and closes it; gives the body's status.
//   PF_OPENFAIL  the path cannot be written; texts: the path, empty
template <class Body>
[[nodiscard]] TEVPF_STATUS write_report(const char* path, Body body) noexcept {
  std::FILE* const stream = std::fopen(path, "w");
  if (stream == nullptr) return fail(PF_OPENFAIL, path);
  TEVPF_STATUS status = PF_NORMAL;
  {
    TextOut out(stream);
    status = body(out);
  }
  std::fclose(stream);
  return status;
}

// The entries of an index, two a line, as debug output shows them.
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

// The address of a block as debug output shows it.
inline std::uintptr_t address_of(const void* block) noexcept {
  return reinterpret_cast<std::uintptr_t>(block);
}

}  // namespace tevpf
