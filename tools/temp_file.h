// A file under construction: it takes its final name only when it is whole, and is removed
// otherwise.
#pragma once

#include <filesystem>
#include <string>

namespace tool {

class TempFile {
 public:
  // An empty new file beside `target`, so that it can be renamed to it.
  static TempFile beside(const std::filesystem::path& target);
  // One in the system's folder for temporary files, readable by this user alone.
  static TempFile anywhere();

  TempFile(TempFile&& other) noexcept;
  TempFile& operator=(TempFile&&) = delete;
  ~TempFile();

  const std::filesystem::path& path() const { return path_; }

  // Takes the target's place, with the permissions and the owner that the target had.
  void replace(const std::filesystem::path& target);

 private:
  explicit TempFile(std::filesystem::path path);
  std::filesystem::path path_;
};

}  // namespace tool
