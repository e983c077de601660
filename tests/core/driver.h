// The current file, saved and driven by tests of the file format.
#pragma once

#include <gtest/gtest.h>

#include <random>
#include <string>

#include "core/directory.h"
#include "core/file.h"
#include "core/library.h"
#include "include/tevpf.h"
#include "lists/list.h"
#include "support/drive.h"
#include "support/temp_dir.h"
#include "tables/table.h"

inline std::string saved_bytes(const TempDir& dir) {
  const std::string path = dir / "saved";
  std::filesystem::remove(path);  // some file systems flush a file that is emptied and filled again
  EXPECT_EQ(TEV8R1_PF_save(path.c_str()), PF_NORMAL);
  return read_file(path);
}

// The current file, saved and opened again, is saved to the same bytes; it becomes current again.
inline void expect_reopens_alike(const TempDir& dir) {
  const std::string own = tevpf::library.current_file->file_name;
  const std::string bytes = saved_bytes(dir);
  write_file(dir / "again", bytes);
  ASSERT_EQ(TEV8R1_PF_open((dir / "again").c_str()), PF_NORMAL);
  EXPECT_EQ(saved_bytes(dir), bytes);
  EXPECT_EQ(TEV8R1_PF_close(0), PF_NORMAL);
  EXPECT_EQ(TEV8R1_PF_change_file(own.c_str()), PF_NORMAL);
}

inline void drive_current_file(const TempDir& dir) {
  expect_reopens_alike(dir);
  std::mt19937 random(1);
  std::string choices(200, '\0');
  for (char& choice : choices) choice = static_cast<char>(random());
  EXPECT_NO_THROW(drive_current_file(dir.path(), {choices}));
  expect_reopens_alike(dir);
}
