#include "temp_file.h"

#include <utility>

#include "failure.h"
#include "platform.h"
#include "text.h"

namespace fs = std::filesystem;

namespace tool {

TempName::TempName(fs::path path) : path_(std::move(path)) { remove_on_interrupt(path_); }

TempName::~TempName() {
  if (path_.empty()) return;
  std::error_code ignored;
  fs::remove(path_, ignored);
  forget();
}

void TempName::forget() {
  path_.clear();
  remove_on_interrupt({});
}

TempFile::TempFile(fs::path target) : target_(std::move(target)) {
  const HoldInterrupts hold;  // until the file is known as one to remove
  fs::path path = unused_path_beside(target_);
  stream_ = create_private_file(path);
  if (stream_ == nullptr) {
    const std::error_code error = last_error();
    const fs::path folder = target_.parent_path();
    throw Failure(kCannotWrite, "cannot create a file in " +
                                    in_quotes(folder.empty() ? "." : name_of(folder)) + ": " +
                                    error.message() + "; make room or choose another folder");
  }
  name_.emplace(std::move(path));
}

TempFile::~TempFile() {
  if (stream_ != nullptr) std::fclose(stream_);
}

std::error_code TempFile::replace_target() {
  std::error_code error;
  const auto require = [&](bool done) {
    if (!done && !error) error = last_error();
  };
  require(copy_rights(stream_, target_));
  require(flush_to_disk(stream_));
  require(std::fclose(std::exchange(stream_, nullptr)) == 0);
  if (!error) fs::rename(name_->path(), target_, error);
  if (!error) name_->forget();
  return error;
}

}  // namespace tool
