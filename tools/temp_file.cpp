#include "temp_file.h"

#include <cerrno>
#include <cstring>
#include <random>
#include <system_error>
#include <utility>

#include "failure.h"
#include "platform.h"
#include "text.h"

namespace fs = std::filesystem;

namespace tool {
namespace {

std::string random_letters() {
  static constexpr std::string_view kLetters = "abcdefghijklmnopqrstuvwxyz0123456789";
  std::random_device device;
  std::uniform_int_distribution<std::size_t> pick(0, kLetters.size() - 1);
  std::string letters(10, ' ');
  for (char& letter : letters) letter = kLetters[pick(device)];
  return letters;
}

fs::path new_file(const fs::path& folder, const std::string& prefix, bool is_private) {
  for (int attempt = 0; attempt < 100; ++attempt) {
    fs::path path = folder / (prefix + random_letters());
    if (create_exclusively(path, is_private)) return path;
    if (errno != EEXIST) break;
  }
  const std::string place = folder.empty() ? "." : folder.string();
  throw Failure(kCannotWrite, "cannot create a file in " + in_quotes(place) + ": " +
                                  std::strerror(errno) + "; make room or choose another folder");
}

}  // namespace

TempFile::TempFile(fs::path path) : path_(std::move(path)) { remove_on_interrupt(path_); }

TempFile::TempFile(TempFile&& other) noexcept : path_(std::exchange(other.path_, {})) {}

TempFile TempFile::beside(const fs::path& target) {
  return TempFile(new_file(target.parent_path(), ".tevpf-", false));
}

TempFile TempFile::anywhere() {
  std::error_code error;
  const fs::path folder = fs::temp_directory_path(error);
  return TempFile(new_file(error ? fs::path(".") : folder, "tevpf-", true));
}

TempFile::~TempFile() {
  if (path_.empty()) return;
  std::error_code ignored;
  fs::remove(path_, ignored);
  remove_on_interrupt({});
}

void TempFile::replace(const fs::path& target) {
  std::error_code error, ignored;
  if (!flush_to_disk(path_)) {
    error = std::error_code(errno, std::generic_category());
  } else {
    const fs::file_status old = fs::status(target, ignored);
    if (fs::is_regular_file(old)) {
      copy_owner(target, path_);
      fs::permissions(path_, old.permissions(), ignored);
    }
    fs::rename(path_, target, error);
  }
  if (error) {
    throw Failure(kCannotWrite, in_quotes(target.string()) + " cannot be written: " +
                                    error.message() + "; it is as it was before");
  }
  path_.clear();
  remove_on_interrupt({});
}

}  // namespace tool
