#include "temp_file.h"

#include <utility>

#include "failure.h"
#include "platform.h"
#include "text.h"

namespace fs = std::filesystem;

namespace tool {

TempFile::TempFile(fs::path target) : target_(std::move(target)) {
  const HoldInterrupts hold;  // until the file is known as one to remove
  const fs::path folder = target_.parent_path();
  std::string name = (folder / ".tevpf-XXXXXX").string();
  stream_ = make_unique_file(name);
  if (stream_ == nullptr) {
    throw Failure(kCannotWrite,
                  "cannot create a file in " + in_quotes(folder.empty() ? "." : folder.string()) +
                      ": " + last_error().message() + "; make room or choose another folder");
  }
  name_ = std::move(name);
  remove_on_interrupt(name_);
}

TempFile::~TempFile() {
  if (stream_ != nullptr) std::fclose(stream_);
  if (name_.empty()) return;
  std::error_code ignored;
  fs::remove(name_, ignored);
  remove_on_interrupt({});
}

std::string TempFile::path_for_library() const { return path_of(stream_, name_); }

std::error_code TempFile::commit(bool replace) {
  std::error_code error;
  const auto require = [&](bool done) {
    if (!done && !error) error = last_error();
  };
  require(copy_rights(stream_, replace ? target_ : fs::path()));
  require(flush_to_disk(stream_));
  require(std::fclose(std::exchange(stream_, nullptr)) == 0);
  if (!error && replace) fs::rename(name_, target_, error);
  if (!error && !replace) require(rename_to_new(name_, target_));
  if (!error) {
    name_.clear();
    remove_on_interrupt({});
  }
  return error;
}

}  // namespace tool
