// A parameter file of its own for each test: open and new at the start, closed and gone at the end.
#pragma once

#include <gtest/gtest.h>

#include <string>

#include "core/directory.h"
#include "support/error_texts.h"
#include "support/state.h"
#include "support/temp_dir.h"

class TempFileTest : public testing::Test {
 protected:
  TempFileTest() {
    TEV8R1_PF_init();
    EXPECT_EQ(TEV8R1_PF_open(path_.c_str()), PF_NEWFILE);
    set_error_texts();
  }
  ~TempFileTest() override {
    while (TEV8R1_PF_close(0) == PF_NORMAL) {
    }
    TEV8R1_PF_set_memory_allocation(0, 0);
    TEV8R1_turn_off_interactive();
  }

  void save_and_reopen() {
    ASSERT_EQ(TEV8R1_PF_close(1), PF_NORMAL);
    ASSERT_EQ(TEV8R1_PF_open(path_.c_str()), PF_NORMAL);
  }

  static TEVPF_LIST& list(const std::string& name) {
    TEVPF_LIST* found = nullptr;
    EXPECT_EQ(TEV8R1_get_list_ptr(name.c_str(), &found), PF_NORMAL);
    return *found;
  }

  TempDir dir_;
  const std::string path_ = dir_ / "file";
};
