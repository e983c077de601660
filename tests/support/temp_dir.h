// Files and folders of a test, and bytes as tests write them down.
#pragma once

#include <gtest/gtest.h>
#include <stdlib.h>

#include <filesystem>
#include <fstream>
#include <iterator>
#include <set>
#include <string>

// A folder that goes away with the test.
class TempDir {
 public:
  TempDir() : path_(testing::TempDir() + "tevpf_XXXXXX") {
    if (mkdtemp(path_.data()) == nullptr) ADD_FAILURE() << "no folder " << path_;
  }
  ~TempDir() {
    std::error_code ignored;
    std::filesystem::remove_all(path_, ignored);
  }
  TempDir(const TempDir&) = delete;
  TempDir& operator=(const TempDir&) = delete;

  const std::string& path() const { return path_; }
  std::string operator/(const std::string& name) const { return path_ + "/" + name; }
  std::set<std::string> entries() const {
    std::set<std::string> names;
    for (const auto& entry : std::filesystem::directory_iterator(path_)) {
      names.insert(entry.path().filename().string());
    }
    return names;
  }

 private:
  std::string path_;
};

inline std::string read_file(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(in), {}};
}

inline void write_file(const std::string& path, const std::string& bytes) {
  if (std::filesystem::is_regular_file(path)) std::filesystem::remove(path);
  std::ofstream(path, std::ios::binary) << bytes;
}

// "0b 00 ..." as bytes.
inline std::string from_hex(const std::string& text) {
  std::istringstream in(text);
  std::string bytes;
  for (unsigned byte; in >> std::hex >> byte;) bytes += static_cast<char>(byte);
  return bytes;
}
