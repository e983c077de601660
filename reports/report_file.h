// The text file that a report goes to.
#pragma once

#include <cstdio>

#include "core/base/status.h"
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

}  // namespace tevpf
