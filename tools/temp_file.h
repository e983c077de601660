// Files under construction, which get their final names only when they are whole, and are removed
// otherwise: by an interrupt, too.
#pragma once

#include <cstdio>
#include <filesystem>
#include <optional>
#include <string>
#include <system_error>

namespace tool {

// The name of a file that this program has made, and removes again.
class TempName {
 public:
  explicit TempName(std::filesystem::path path);
  TempName(const TempName&) = delete;
  TempName& operator=(const TempName&) = delete;
  ~TempName();

  const std::filesystem::path& path() const { return path_; }
  void forget();  // it stands for the file no longer

 private:
  std::filesystem::path path_;  // empty: forgotten
};

// A file that takes the place of another one. This user's alone until then, and opened once:
// whatever happens to its name, nothing else is written.
class TempFile {
 public:
  // An empty new file beside `target`, which will be its final name.
  explicit TempFile(std::filesystem::path target);
  TempFile(const TempFile&) = delete;
  TempFile& operator=(const TempFile&) = delete;
  ~TempFile();

  std::FILE* stream() const { return stream_; }

  // It is whole, and takes the place of the target, with the permissions and the owner of what
  // stood there. After an error, that is as it was.
  [[nodiscard]] std::error_code replace_target();

 private:
  std::filesystem::path target_;
  std::optional<TempName> name_;
  std::FILE* stream_ = nullptr;
};

}  // namespace tool
