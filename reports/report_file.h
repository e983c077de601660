// The text file that a report is written to.
#pragma once

#include <cstdio>

#include "core/base/status.h"
#include "core/io/disk_file.h"
#include "reports/text_out.h"

namespace tevpf {

// Creates or truncates the file, lets `body` write to it, closes it, and returns the status of
// `body`.
//   PF_OPENFAIL  the path cannot be opened for writing; texts: the path, empty
template <class Body>
[[nodiscard]] TEVPF_STATUS write_report(const char* path, Body body) noexcept {
  std::FILE* const stream = open_stream(path, "w");
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
