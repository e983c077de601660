// Files and folders of a test, and bytes as tests write them down.
#pragma once

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <random>
#include <set>
#include <string>
#include <vector>

#include "lists/directory.h"
#include "lists/settle.h"
#include "support/error_texts.h"
#include "support/param_def.h"
#include "support/read_file.h"
#include "support/state.h"
#include "tables/settle.h"

// A folder that goes away with the test.
class TempDir {
 public:
  TempDir() : path_(testing::TempDir() + "tevpf_" + std::to_string(std::random_device{}())) {
    std::error_code error;
    if (!std::filesystem::create_directory(path_, error)) ADD_FAILURE() << "no folder " << path_;
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

// The lines of a report, however the system ends them.
inline std::string read_text(const std::string& path) { return read_file(path, std::ios::in); }

inline void write_file(const std::string& path, const std::string& bytes) {
  if (std::filesystem::is_regular_file(path)) std::filesystem::remove(path);
  std::ofstream(path, std::ios::binary) << bytes;
}

// The library with no file open, at the start and at the end.
class LibraryTest : public testing::Test {
 protected:
  LibraryTest() {
    TEV8R1_PF_init();
    set_error_texts();
  }
  ~LibraryTest() override { close_all(); }

  static void close_all() {
    while (TEV8R1_PF_close(0) == PF_NORMAL) {
    }
    TEV8R1_PF_set_memory_allocation(0, 0);
    TEV8R1_turn_off_interactive();
  }

  TempDir dir_;
};

// A parameter file of its own for each test: open and new at the start.
class TempFileTest : public LibraryTest {
 protected:
  TempFileTest() {
    EXPECT_EQ(TEV8R1_PF_open(path_.c_str()), PF_NEWFILE);
    set_error_texts();
  }

  void save_and_reopen() {
    ASSERT_EQ(TEV8R1_PF_close(1), PF_NORMAL);
    ASSERT_EQ(TEV8R1_PF_open(path_.c_str()), PF_NORMAL);
  }

  static void make_list(const char* name, const char* description, const std::vector<Def>& params) {
    ASSERT_EQ(TEV8R1_PF_create_elem(name, description, PF_ELEM_LIST), PF_NORMAL);
    for (const Def& def : params) {
      const TEVPF_PARAM_DEF c = to_c(def);
      ASSERT_EQ(TEV8R1_PF_add_param(name, &c, PF_END_POS), PF_NORMAL) << def.name;
    }
  }
  static TEVPF_LIST& list(const std::string& name) {
    TEVPF_LIST* found = nullptr;
    EXPECT_EQ(TEV8R1_get_list_ptr(name.c_str(), &found), PF_NORMAL);
    return *found;
  }

  const std::string path_ = dir_ / "file";
};
