// Saving and closing files.
#include <cerrno>
#include <cstdio>
#include <cstring>

#include "core/base/status.h"
#include "core/file.h"
#include "core/io/disk_file.h"
#include "core/io/replacement.h"
#include "core/library.h"
#include "core/writer.h"

namespace tevpf {

namespace {

// Replaces the file's stream with a stream for writing and closes the old one.
void adopt_stream(TEVPF_FILE& file, std::FILE* stream) noexcept {
  if (file.fp != nullptr) std::fclose(file.fp);
  file.fp = stream;
}

// Truncates the file on disk and rewrites it. The old stream is closed first: data that a failed
// write left in its buffer must not reach the new file.
TEVPF_STATUS overwrite(TEVPF_FILE& file) noexcept {
  adopt_stream(file, nullptr);
  adopt_stream(file, open_stream(file.file_name, "wb"));
  if (file.fp == nullptr) return fail(PF_OPENFAIL, file.file_name);
  return write_elements(file, file.fp, file.file_name);
}

// The result of replacing an existing file with the elements of a file.
struct Replaced {
  bool possible;        // false: nothing was done, and the caller writes plainly
  TEVPF_STATUS status;  // when it was possible
  std::FILE* stream;    // refers to the new file; null if the old one is still in place
};

// `stream` is a stream of the existing file, or null. Windows replaces no open file: there it is
// closed and set to null.
Replaced replace_existing(const TEVPF_FILE& file, const char* name, std::FILE*& stream) noexcept {
  Replacement replacement(name);
  if (replacement.has_failed()) return {true, fail(PF_OPENFAIL, name), nullptr};
  if (!replacement.is_possible()) return {false, PF_NORMAL, nullptr};
  const TEVPF_STATUS status = write_elements(file, replacement.stream(), name);
  if (status != PF_NORMAL) return {true, status, nullptr};
  switch (replacement.put_in_place(stream)) {
    case Replacement::Outcome::kDone:
      return {true, PF_NORMAL, replacement.release_stream()};
    case Replacement::Outcome::kNotFlushed:
      return {true, fail(PF_OPENFAIL, name), replacement.release_stream()};
    case Replacement::Outcome::kFailed:
      return {true, fail(PF_OPENFAIL, name), nullptr};
    case Replacement::Outcome::kNotPossible:
      break;
  }
  return {false, PF_NORMAL, nullptr};
}

// Rewrites the file: by an image that replaces it once complete, or else plainly.
TEVPF_STATUS rewrite(TEVPF_FILE& file) noexcept {
  const Replaced replaced = replace_existing(file, file.file_name, file.fp);
  if (!replaced.possible) return overwrite(file);
  if (replaced.stream != nullptr) adopt_stream(file, replaced.stream);
  return replaced.status;
}

TEVPF_STATUS save_in_place(TEVPF_FILE& file) noexcept {
  if (file.read_only != 0) return fail(PF_NOPRIV, file.file_name);
  file.new_file = 0;
  return rewrite(file);
}

// Writes a copy to a new file, or to one that cannot be replaced. An incomplete copy is removed if
// this call created the file.
TEVPF_STATUS write_copy(const TEVPF_FILE& file, const char* path) noexcept {
  std::FILE* stream = create_file(path);
  const bool created = stream != nullptr;
  if (!created && errno == EEXIST) stream = open_stream(path, "wb");
  if (stream == nullptr) return fail(access_denied(errno) ? PF_NOPRIV : PF_OPENFAIL, path);
  TEVPF_STATUS status = write_elements(file, stream, path);
  if (created && status != PF_NORMAL) {
    remove_own_file(path, stream);
    return status;
  }
  const bool closed = std::fclose(stream) == 0;
  if (closed || status != PF_NORMAL) return status;
  if (created) remove_file(path);
  return fail(PF_OPENFAIL, path);
}

TEVPF_STATUS save_copy(const TEVPF_FILE& file, const char* path) noexcept {
  std::FILE* none = nullptr;
  const Replaced replaced = replace_existing(file, path, none);
  if (!replaced.possible) return write_copy(file, path);
  const bool closed = replaced.stream == nullptr || std::fclose(replaced.stream) == 0;
  return replaced.status == PF_NORMAL && !closed ? fail(PF_OPENFAIL, path) : replaced.status;
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
  if (file->new_file != 0) {
    remove_own_file(file->file_name, file->fp);
  } else if (file->fp != nullptr && std::fclose(file->fp) != 0 && save != 0 &&
             status == PF_NORMAL) {
    status = fail(PF_OPENFAIL, file->file_name);
  }
  unlink_file(*file);
  TEV8R1_free_file(file);
  return status;
}
