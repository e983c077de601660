// What is the same on all platforms.
#include "platform.h"

#include <cerrno>
#include <random>

namespace fs = std::filesystem;

namespace tool {

fs::path path_of(const std::string& name) { return std::u8string(name.begin(), name.end()); }

std::string name_of(const fs::path& path) {
  const std::u8string name = path.u8string();
  return {name.begin(), name.end()};
}

std::error_code last_error() { return {errno, std::generic_category()}; }

fs::path unused_path_beside(const fs::path& target) {
  static constexpr std::string_view kLetters = "abcdefghijklmnopqrstuvwxyz0123456789";
  static constexpr int kLength = 8;
  std::random_device random;
  std::uniform_int_distribution<std::size_t> letter(0, kLetters.size() - 1);
  std::string name = ".tevpf-";
  for (int i = 0; i < kLength; ++i) name += kLetters[letter(random)];
  return target.parent_path() / name;
}

}  // namespace tool
