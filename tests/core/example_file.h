// The example of docs/file-format.md, as bytes; and the current file, saved and driven.
#pragma once

#include <fstream>
#include <random>
#include <string>

#include "core/directory.h"
#include "support/drive.h"
#include "support/state.h"
#include "support/temp_dir.h"

// Lines read "offset  bytes  comment", two blanks apart.
inline std::string example_bytes() {
  std::ifstream in(TEVPF_FORMAT_DOCUMENT);
  std::string bytes;
  bool inside = false;
  for (std::string line; std::getline(in, line);) {
    if (line.rfind("```", 0) == 0) {
      inside = line == "```hex";
    } else if (inside) {
      EXPECT_EQ(std::stoul(line.substr(0, 4), nullptr, 16), bytes.size()) << line;
      bytes += from_hex(line.substr(6, line.find("   ", 6) - 6));
    }
  }
  return bytes;
}

constexpr std::size_t kListBytes = 0xf3;     // of the example's list; its table follows
constexpr std::size_t kNameIndex = 0xeb;     // of the list
constexpr std::size_t kColumnIndex = 0x1e1;  // of the table
constexpr std::size_t kRows = 0x1ed;
constexpr std::size_t kHead = 108;  // an element's head

inline std::string saved_bytes(const TempDir& dir) {
  const std::string path = dir / "saved";
  std::filesystem::remove(path);  // some file systems flush a file that is emptied and filled again
  EXPECT_EQ(TEV8R1_PF_save(path.c_str()), PF_NORMAL);
  return read_file(path);
}

inline void drive_current_file(const TempDir& dir) {
  std::mt19937 random(1);
  std::string choices(200, '\0');
  for (char& choice : choices) choice = static_cast<char>(random());
  EXPECT_NO_THROW(drive_current_file(dir.path(), {choices}));
}
