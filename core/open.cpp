// Opening files.
#include <cerrno>
#include <cstdio>
#include <utility>

#include "core/file.h"
#include "core/file_name.h"
#include "core/reader.h"
#include "core/status.h"

namespace tevpf {

namespace {

struct OpenedStream {
  std::FILE* stream;
  bool read_only;
  bool created;
};

// For update where that is allowed, else for reading; a file that is not there, or gives neither
// right, is made anew. Any other failure is no reason to empty a file that may be there: it may
// pass.
OpenedStream open_or_create(const char* name) noexcept {
  if (std::FILE* stream = std::fopen(name, "r+b")) return {stream, false, false};
  if (access_denied(errno)) {
    if (std::FILE* stream = std::fopen(name, "rb")) return {stream, true, false};
  }
  if (errno != ENOENT && !access_denied(errno)) return {nullptr, false, false};
  return {std::fopen(name, "wb"), false, true};
}

}  // namespace

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_PF_open(const char* name) noexcept {
  FileName file_name;
  PF_TRY(translate_file_name(name, file_name));
  if (find_open_file(file_name.text) != nullptr) return fail_empty(PF_FILEOPEN);

  // Before a file is created: a failure leaves nothing behind.
  Owned<TEVPF_FILE> record = new_file_record(file_name.text);
  if (!record) return fail_empty(PF_NOMEM);
  const OpenedStream opened = open_or_create(file_name.text);
  if (opened.stream == nullptr) return fail(PF_OPENFAIL, file_name.text);
  TEVPF_FILE& file = append_file(std::move(record), opened.stream, opened.read_only);
  if (!opened.created) return load_file(file);
  file.new_file = 1;
  return PF_NEWFILE;
}
