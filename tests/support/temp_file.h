// A parameter file of its own for each test: open and new at the start, closed and gone at the end.
#pragma once

#include <gtest/gtest.h>

#include <cstdio>
#include <string>

#include "core/directory.h"
#include "include/tevpf.h"

class TempFileTest : public ::testing::Test {
 protected:
  TempFileTest() {
    const auto* const test = ::testing::UnitTest::GetInstance()->current_test_info();
    path_ = ::testing::TempDir() + "tevpf_" + test->test_suite_name() + "_" + test->name() + ".tpf";
    std::remove(path_.c_str());
    TEV8R1_PF_init();
    EXPECT_EQ(TEV8R1_PF_open(path_.c_str()), PF_NEWFILE);
  }
  ~TempFileTest() override {
    TEV8R1_PF_close(0);
    std::remove(path_.c_str());
    TEV8R1_PF_set_memory_allocation(0, 0);
    TEV8R1_turn_off_interactive();
  }

  void save_and_reopen() {
    ASSERT_EQ(TEV8R1_PF_close(1), PF_NORMAL);
    ASSERT_EQ(TEV8R1_PF_open(path_.c_str()), PF_NORMAL);
  }

  static TEVPF_LIST& list(const std::string& name) {
    TEVPF_LIST* found = nullptr;
    if (TEV8R1_get_list_ptr(name.c_str(), &found) != PF_NORMAL) std::abort();
    return *found;
  }

  std::string path_;
};
