// A file under construction: this user's alone until it takes its final name, which it does only
// when it is whole; removed otherwise. It is opened once: whatever happens to its name, nothing
// else is written.
#pragma once

#include <cstdio>
#include <filesystem>
#include <string>
#include <system_error>

namespace tool {

class TempFile {
 public:
  // An empty new file beside `target`, which will be its final name.
  explicit TempFile(std::filesystem::path target);
  TempFile(const TempFile&) = delete;
  TempFile& operator=(const TempFile&) = delete;
  ~TempFile();

  std::FILE* stream() const { return stream_; }
  std::string path_for_library() const;

  // It is whole, and takes the place of the target, with the permissions and the owner of what
  // stood there. After an error, that is as it was.
  [[nodiscard]] std::error_code replace_target() { return commit(true); }
  // The same, but a file that has come to stand there stays, and this is an error.
  [[nodiscard]] std::error_code become_target() { return commit(false); }

 private:
  std::error_code commit(bool replace);

  std::filesystem::path target_;
  std::string name_;  // empty: not, or no longer, a temporary file
  std::FILE* stream_ = nullptr;
};

}  // namespace tool
