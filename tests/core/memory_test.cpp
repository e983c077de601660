// Files when memory runs out, beyond what holds for every operation.
#include <gtest/gtest.h>

#include <cstdlib>

#include "core/heap.h"
#include "driver.h"
#include "example_file.h"
#include "support/error_texts.h"

namespace {

class MemoryTest : public testing::Test {
 protected:
  MemoryTest() { TEV8R1_PF_init(); }

  // The example, opened; in `path`.
  void start() {
    write_file(path_, example_);
    ASSERT_EQ(TEV8R1_PF_open(path_.c_str()), PF_NORMAL);
    set_error_texts();
  }

  TempDir dir_;
  const std::string path_ = dir_ / "file", example_ = example_bytes();
};

// What was loaded before memory ran out stays, and can be worked with.
TEST_F(MemoryTest, HalfAFileIsWholeElements) {
  std::string bytes = example_;
  bytes.replace(kColumnIndex, 4, std::string(4, '\0'));  // an index to be built again
  for (int n = 0;; ++n) {
    SCOPED_TRACE(n);
    write_file(path_, bytes);
    set_error_texts();
    tevpf::heap_fail_at(n);
    const TEVPF_STATUS status = TEV8R1_PF_open(path_.c_str());
    const bool failed = tevpf::heap_fail_off();
    EXPECT_EQ(status, failed ? PF_NOMEM : PF_NORMAL);
    EXPECT_EQ(error_texts(), failed ? kEmpty : kUntouched);
    if (n == 0) {
      EXPECT_EQ(tevpf::library.current_file, nullptr);
      continue;
    }
    drive_current_file(dir_);
    ASSERT_EQ(TEV8R1_PF_close(0), PF_NORMAL);
    if (!failed) break;
  }
}

TEST_F(MemoryTest, WhatWasHandedOutBelongsToTheCaller) {
  start();
  for (int n = 0; n <= 4; ++n) {
    char file[TEVPF_FILE_NAME_SIZE];
    std::int32_t lists = 0, tables = 0;
    char(*names[2])[TEVPF_NAME_SIZE] = {};
    char(*descs[2])[TEVPF_DESC_SIZE] = {};
    tevpf::heap_fail_at(n);
    const TEVPF_STATUS status = TEV8R1_PF_inq_file_elements(file, &lists, &names[0], &descs[0],
                                                            &tables, &names[1], &descs[1]);
    EXPECT_EQ(status, tevpf::heap_fail_off() ? PF_NOMEM : PF_NORMAL);
    const int handed_out = (names[0] != nullptr) + (descs[0] != nullptr) + (names[1] != nullptr) +
                           (descs[1] != nullptr);
    EXPECT_EQ(handed_out, n);
    EXPECT_EQ(tables, n < 2 ? 0 : 1);
    for (int k = 0; k < 2; ++k) {
      std::free(names[k]);
      std::free(descs[k]);
    }
  }
  ASSERT_EQ(TEV8R1_PF_close(0), PF_NORMAL);
}

TEST_F(MemoryTest, ArraysGrowOrStay) {
  void* array = nullptr;
  void* first_new = nullptr;
  ASSERT_EQ(TEV8R1_allocate_elem(0, 3, 4, &array, &first_new), PF_NORMAL);
  EXPECT_EQ(first_new, array);
  auto* numbers = static_cast<std::int32_t*>(array);
  EXPECT_EQ(std::vector<std::int32_t>(numbers, numbers + 3), std::vector<std::int32_t>(3, 0));
  numbers[0] = 5;
  numbers[1] = 9;
  EXPECT_EQ(TEV8R1_insert_index_value(numbers, 2, 1, 7), PF_NORMAL);
  EXPECT_EQ(std::vector<std::int32_t>(numbers, numbers + 3), (std::vector<std::int32_t>{5, 7, 9}));
  const std::int32_t extremes[][3] = {
      {3, INT32_MAX, INT32_MAX}, {INT32_MAX, 1, INT32_MAX}, {-1, 2, 4}, {3, -4, 4},
      {3, 1, INT32_MIN},         {INT32_MIN, INT32_MIN, -1}};
  tevpf::heap_fail_above(1 << 30);  // the sanitizer's allocator stops at larger ones
  for (const auto& [count, increment, size] : extremes) {
    void* const before = array;
    set_error_texts();
    EXPECT_EQ(TEV8R1_allocate_elem(count, increment, size, &array, &first_new), PF_NOMEM);
    EXPECT_EQ(error_texts(), kEmpty);
    EXPECT_EQ(array, before);
  }
  tevpf::heap_fail_above(UINT64_MAX);
  ASSERT_EQ(TEV8R1_allocate_elem(3, 1000, 4, &array, &first_new), PF_NORMAL);
  numbers = static_cast<std::int32_t*>(array);
  EXPECT_EQ(first_new, numbers + 3);
  EXPECT_EQ(TEV8R1_memcpy(12, numbers, numbers + 1), PF_NORMAL);
  EXPECT_EQ(std::vector<std::int32_t>(numbers, numbers + 4),
            (std::vector<std::int32_t>{5, 5, 7, 9}));
  std::free(array);
}

}  // namespace
