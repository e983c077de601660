// Opening files.
#include <cerrno>
#include <cstdio>
#include <utility>

#include "core/base/status.h"
#include "core/file.h"
#include "core/file_name.h"
#include "core/io/disk_file.h"
#include "core/reader.h"

namespace tevpf {

namespace {

struct OpenedStream {
  std::FILE* stream;
  bool read_only;
  bool created;
};

// A file that can be written but not read is treated as new and is emptied.
OpenedStream open_emptied(const char* name) noexcept {
  std::FILE* const stream = open_regular(name, Access::kWrite);
  if (stream == nullptr || empty_file(stream)) return {stream, false, true};
  std::fclose(stream);
  return {nullptr, false, false};
}

// Opens for update if permitted, otherwise for reading. A failure other than "not found" or
// "permission denied" may be temporary, so it is no reason to create a file.
OpenedStream open_existing(const char* name) noexcept {
  if (std::FILE* const stream = open_regular(name, Access::kUpdate)) return {stream, false, false};
  if (!access_denied(errno)) return {nullptr, false, false};
  if (std::FILE* const stream = open_regular(name, Access::kRead)) return {stream, true, false};
  return access_denied(errno) ? open_emptied(name) : OpenedStream{nullptr, false, false};
}

// If the file appears between the check and the creation, it is opened with its content.
OpenedStream open_or_create(const char* name) noexcept {
  constexpr int kTries = 3;  // only a dangling symbolic link exhausts them
  for (int i = 0; i < kTries; ++i) {
    const OpenedStream existing = open_existing(name);
    if (existing.stream != nullptr || errno != ENOENT) return existing;
    std::FILE* const created = create_file(name);
    if (created != nullptr || errno != EEXIST) return {created, false, true};
  }
  return {nullptr, false, false};
}

}  // namespace

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_PF_open(const char* name) noexcept {
  FileName file_name;
  PF_TRY(translate_file_name(name, file_name));
  if (find_open_file(file_name.text) != nullptr) return fail_empty(PF_FILEOPEN);

  // Allocated before a file is created, so that a failure leaves no file behind.
  Owned<TEVPF_FILE> record = new_file_record(file_name.text);
  if (!record) return fail_empty(PF_NOMEM);
  const OpenedStream opened = open_or_create(file_name.text);
  if (opened.stream == nullptr) return fail(PF_OPENFAIL, file_name.text);
  TEVPF_FILE& file = append_file(std::move(record), opened.stream, opened.read_only);
  if (!opened.created) return load_file(file);
  file.new_file = 1;
  return PF_NEWFILE;
}
