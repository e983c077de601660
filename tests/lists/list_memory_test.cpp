// Lists when memory runs out, beyond what holds for every operation.
#include <gtest/gtest.h>

#include "core/heap.h"
#include "support/list_check.h"
#include "support/param_def.h"
#include "support/temp_file.h"

namespace {

const Def kNumber{PF_TYPE_DOUBLE, "number", "m", "about it", 1.5};

using ListMemory = TempFileTest;

TEST_F(ListMemory, FirstDefaultsAreMadeWholeOrNotAtAll) {
  for (int request = 0; request < 2; ++request) {
    ASSERT_EQ(TEV8R1_PF_create_elem("fresh", "", PF_ELEM_LIST), PF_NORMAL);
    tevpf::heap_fail_at(request);
    EXPECT_EQ(TEV8R1_PF_set_param_dft("fresh", to_c(kNumber)), PF_NOMEM);
    EXPECT_TRUE(tevpf::heap_fail_off());
    EXPECT_EQ(list("fresh").dft_ptr, nullptr);
    TEV8R1_PF_delete_list("fresh");
  }
}

TEST_F(ListMemory, TableOfNamesIsNotNeeded) {
  ASSERT_EQ(TEV8R1_PF_create_elem("many", "", PF_ELEM_LIST), PF_NORMAL);
  const auto add = [](int i) {
    const TEVPF_PARAM_DEF c = to_c({PF_TYPE_INT, "p" + std::to_string(i)});
    return TEV8R1_PF_add_param("many", &c, PF_END_POS);
  };
  for (int i = 0; i < 32; ++i) ASSERT_EQ(add(i), PF_NORMAL);
  TEVPF_LIST& many = list("many");
  const auto look_up_twice = [] {  // which pays for a table of so few names
    EXPECT_EQ(TEV8R1_inq_param_exists("many", "p31"), PF_NORMAL);
    EXPECT_EQ(TEV8R1_inq_param_exists("many", "p32"), PF_NOPARAM);
  };
  tevpf::heap_fail_at(0);
  look_up_twice();
  EXPECT_TRUE(tevpf::heap_fail_off());
  EXPECT_EQ(many.names.slots, nullptr);
  look_up_twice();
  EXPECT_NE(many.names.slots, nullptr);
  // A full table that cannot grow is given up; the parameter is added all the same.
  ASSERT_GT(many.free_params, 0);
  tevpf::heap_fail_at(0);
  EXPECT_EQ(add(32), PF_NORMAL);
  EXPECT_TRUE(tevpf::heap_fail_off());
  EXPECT_EQ(many.names.slots, nullptr);
  EXPECT_EQ(TEV8R1_inq_param_exists("many", "p32"), PF_NORMAL);
  EXPECT_EQ(broken_rule(many), nullptr);
}

}  // namespace
