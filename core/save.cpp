// Saving and closing files.
#include <cerrno>
#include <cstdio>
#include <cstring>

#include "core/file.h"
#include "core/library.h"
#include "core/replacement.h"
#include "core/status.h"
#include "core/writer.h"

namespace tevpf {

namespace {

// Takes a stream for writing in place of the one that the file had.
void adopt_stream(TEVPF_FILE& file, std::FILE* stream) noexcept {
  if (file.fp != nullptr) std::fclose(file.fp);
  file.fp = stream;
}

// Empties the file on the disk and writes it again. The old stream goes first: what a failed write
// has left in its buffer must not end up in the new file.
TEVPF_STATUS overwrite(TEVPF_FILE& file) noexcept {
  adopt_stream(file, nullptr);
  adopt_stream(file, std::fopen(file.file_name, "wb"));
  if (file.fp == nullptr) return fail(PF_OPENFAIL, file.file_name);
  return write_elements(file, file.fp, file.file_name);
}

// Writes the file in place: by an image that takes its place once it is whole, or else plainly.
TEVPF_STATUS rewrite(TEVPF_FILE& file) noexcept {
  Replacement replacement(file.file_name);
  if (replacement.has_failed()) return fail(PF_OPENFAIL, file.file_name);
  if (!replacement.is_possible()) return overwrite(file);
  PF_TRY(write_elements(file, replacement.stream(), file.file_name));
  switch (replacement.put_in_place()) {
    case Replacement::Outcome::kFailed:
      return fail(PF_OPENFAIL, file.file_name);
    case Replacement::Outcome::kNotPossible:
      return overwrite(file);
    case Replacement::Outcome::kDone:
      break;
  }
  adopt_stream(file, replacement.release_stream());
  return PF_NORMAL;
}

TEVPF_STATUS save_in_place(TEVPF_FILE& file) noexcept {
  if (file.read_only != 0) return fail(PF_NOPRIV, file.file_name);
  file.new_file = 0;
  return rewrite(file);
}

TEVPF_STATUS save_copy(const TEVPF_FILE& file, const char* path) noexcept {
  std::FILE* stream = std::fopen(path, "wb");
  if (stream == nullptr) return fail(access_denied(errno) ? PF_NOPRIV : PF_OPENFAIL, path);
  const TEVPF_STATUS status = write_elements(file, stream, path);
  const bool closed = std::fclose(stream) == 0;
  return status == PF_NORMAL && !closed ? fail(PF_OPENFAIL, path) : status;
}

}  // namespace

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_PF_save(const char* path) noexcept {
  TEVPF_FILE* file = library.current_file;
  if (file == nullptr) return fail_empty(PF_NOFILE);
  if (path == nullptr || std::strcmp(path, file->file_name) == 0) return save_in_place(*file);
  return save_copy(*file, path);
}

TEVPF_STATUS TEV8R1_PF_close(std::int32_t save) noexcept {
  TEVPF_FILE* file = library.current_file;
  if (file == nullptr) return fail_empty(PF_NOFILE);
  if (save != 0 && file->read_only != 0) return fail(PF_NOPRIV, file->file_name);

  TEVPF_STATUS status = save != 0 ? save_in_place(*file) : TEVPF_STATUS{PF_NORMAL};
  const bool closed = file->fp == nullptr || std::fclose(file->fp) == 0;
  if (!closed && save != 0 && status == PF_NORMAL) status = fail(PF_OPENFAIL, file->file_name);
  if (file->new_file != 0) std::remove(file->file_name);
  unlink_file(*file);
  TEV8R1_free_file(file);
  return status;
}
