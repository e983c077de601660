// Every request for memory of every operation on a list fails once: the list is as it was before.
#include <gtest/gtest.h>

#include <functional>

#include "core/heap.h"
#include "support/error_texts.h"
#include "support/list_check.h"
#include "support/param_def.h"
#include "support/temp_file.h"

namespace {

const Def kString{PF_TYPE_STRING, "string", "", "about it", 0, 0, 0, 0, "value"};
const Def kLonger{PF_TYPE_STRING,  "string", "", "a longer description", 0, 0, 0, 0,
                  "a longer value"};
const Def kNumber{PF_TYPE_DOUBLE, "number", "m", "about it", 1.5};

class ListMemory : public TempFileTest {
 protected:
  struct Snapshot {
    std::vector<Def> params, defaults;
    std::int32_t cursor;
    bool operator==(const Snapshot&) const = default;
  };

  // A full list of two parameters, whose string default is not the initial one.
  static void start() {
    TEV8R1_PF_delete_list("list");
    TEV8R1_PF_delete_list("copy");
    ASSERT_EQ(TEV8R1_PF_set_memory_allocation(2, 1), PF_NORMAL);
    ASSERT_EQ(TEV8R1_PF_create_elem("list", "", PF_ELEM_LIST), PF_NORMAL);
    for (const Def& def : {kString, kNumber}) {
      const TEVPF_PARAM_DEF c = to_c(def);
      ASSERT_EQ(TEV8R1_PF_add_param("list", &c, 0), PF_NORMAL);
    }
    ASSERT_EQ(TEV8R1_PF_set_param_dft("list", to_c(kString)), PF_NORMAL);
  }

  static Snapshot snapshot() {
    const TEVPF_LIST& record = list("list");
    Snapshot shot{{}, {}, record.cur_param};
    for (std::int32_t i = 0; i < record.num_params; ++i) {
      shot.params.push_back(from_c(record.param_ptr[i].def));
    }
    for (std::int32_t i = 0; i < 5; ++i) shot.defaults.push_back(from_c(record.dft_ptr[i]));
    return shot;
  }

  // Runs the operation with each of its requests failing; gives the number of requests.
  static int sweep(const std::function<TEVPF_STATUS()>& operation) {
    for (int request = 0;; ++request) {
      SCOPED_TRACE("request " + std::to_string(request));
      start();
      const Snapshot before = snapshot();
      set_error_texts();
      tevpf::heap_fail_at(request);
      const TEVPF_STATUS status = operation();
      const bool failed = tevpf::heap_fail_off();
      EXPECT_EQ(broken_rule(list("list")), nullptr);
      if (!failed) {
        EXPECT_EQ(status, PF_NORMAL);
        return request;
      }
      EXPECT_EQ(status, PF_NOMEM);
      EXPECT_EQ(error_texts(), kEmpty);
      EXPECT_EQ(snapshot(), before);
      TEVPF_LIST* copy;
      EXPECT_EQ(TEV8R1_get_list_ptr("copy", &copy), PF_NOELEM);
      if (HasFailure()) return request;
    }
  }
};

TEST_F(ListMemory, EveryFailureIsUndone) {
  Def added = kLonger;
  added.name = "added";
  const TEVPF_PARAM_DEF to_add = to_c(added);
  Def string_from_number = kLonger;
  string_from_number.name = "number";
  const struct {
    const char* name;
    int requests;  // what the operation is known to need
    std::function<TEVPF_STATUS()> run;
  } operations[] = {
      {"add: two arrays, two texts", 4, [&] { return TEV8R1_PF_add_param("list", &to_add, 1); }},
      {"longer texts", 2, [] { return TEV8R1_PF_modify_param_def("list", to_c(kLonger)); }},
      {"texts that fit", 0, [] { return TEV8R1_PF_modify_param_def("list", to_c(kString)); }},
      {"a number becomes a string", 2,
       [&] { return TEV8R1_PF_modify_param_def("list", to_c(string_from_number)); }},
      {"longer value", 1,
       [] { return TEV8R1_PF_modify_param("list", "string", "a longer value"); }},
      {"value that fits", 0, [] { return TEV8R1_PF_modify_param("list", "string", "short"); }},
      {"set default", 2, [] { return TEV8R1_PF_set_param_dft("list", to_c(kLonger)); }},
      {"inquire default", 2,
       [] {
         TEVPF_PARAM_DEF out{};
         const TEVPF_STATUS status = TEV8R1_PF_inq_param_dft("list", PF_TYPE_STRING, &out);
         std::free(out.description);
         std::free(out.part.str.value);
         return status;
       }},
      {"text to string value", 1,
       [] {
         TEVPF_PARAM_DEF out{};
         const TEVPF_STATUS status = TEV8R1_store_param_value(PF_TYPE_STRING, "text", &out);
         std::free(out.part.str.value);
         return status;
       }},
      // The record, two arrays, three texts, the block of defaults and its two texts.
      {"copy", 9, [] { return TEV8R1_PF_copy_list("list", "copy"); }},
  };
  for (const auto& operation : operations) {
    SCOPED_TRACE(operation.name);
    EXPECT_GE(sweep(operation.run), operation.requests);
  }
}

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
