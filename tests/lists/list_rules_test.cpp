// Single rules of lists that the random sequences do not reach.
#include <gtest/gtest.h>

#include <climits>

#include "core/base/heap.h"
#include "lists/directory.h"
#include "lists/param_record.h"
#include "support/list_check.h"
#include "support/param_def.h"
#include "support/temp_file.h"

namespace {

class ListRules : public TempFileTest {
 protected:
  ListRules() { expect_answer(TEV8R1_PF_create_elem("list", "", PF_ELEM_LIST), PF_NORMAL); }

  static TEVPF_STATUS add(const Def& def) {
    const TEVPF_PARAM_DEF c = to_c(def);
    return TEV8R1_PF_add_param("list", &c, PF_END_POS);
  }
  static void add_numbered(int count) {
    for (int i = 0; i < count; ++i) {
      ASSERT_EQ(add({PF_TYPE_INT, "p" + std::to_string(10 + i)}), PF_NORMAL);
    }
  }
};

TEST_F(ListRules, SizesBeyond31BitsAreRefusedBeforeAnythingChanges) {
  add({PF_TYPE_STRING, "s"});
  set_error_texts();
  TEVPF_LIST& record = list("list");
  record.header.btf = INT_MAX - 5;
  const std::string before = snapshot(true);
  expect_answer(add({PF_TYPE_SHORT, "new"}), PF_NOMEM, kEmpty);
  expect_answer(TEV8R1_PF_modify_param("list", "s", "longer"), PF_NOMEM, kEmpty);
  const Def longer{.type = PF_TYPE_STRING, .name = "s", .text = "longer"};
  expect_answer(TEV8R1_PF_modify_param_def("list", to_c(longer)), PF_NOMEM, kEmpty);
  EXPECT_TRUE(snapshot(true) == before);
  EXPECT_EQ(TEV8R1_PF_modify_param("list", "s", "short"), PF_NORMAL);
  EXPECT_EQ(record.header.btf, INT_MAX);
  // More slots than positions can count.
  ASSERT_EQ(TEV8R1_PF_set_memory_allocation(1, INT_MAX), PF_NORMAL);
  record.free_params = 0;
  EXPECT_EQ(add({PF_TYPE_SHORT, "new"}), PF_NOMEM);
  EXPECT_EQ(record.free_params, 0);
}

// Names of every length: what stands behind the terminator is the caller's, in the buffer and in the field.
TEST_F(ListRules, NamesAreWrittenUpToTheirTerminator) {
  for (std::size_t length = 1; length < TEVPF_NAME_SIZE; ++length) {
    const std::string name(length, static_cast<char>('a' + length));
    TEVPF_PARAM_DEF def = to_c({PF_TYPE_INT, name});
    ASSERT_EQ(TEV8R1_PF_add_param("list", &def, PF_END_POS), PF_NORMAL);
    std::fill(def.name + length + 1, std::end(def.name), '#');
    ASSERT_EQ(TEV8R1_PF_modify_param_def("list", def), PF_NORMAL);
    const auto stored = [&] {
      return std::string(list("list").param_ptr[length - 1].def.name, 20);
    };
    EXPECT_EQ(stored(), std::string(def.name, 20));
    def.name[length - 1] = '*';  // selects, and leaves the name
    def.name[length] = '\0';
    if (length > 1) {
      ASSERT_EQ(TEV8R1_PF_modify_param_def("list", def), PF_NORMAL);
      EXPECT_EQ(stored(), name + '\0' + std::string(19 - length, '#'));
    }
    char out[TEVPF_NAME_SIZE];
    std::fill_n(out, sizeof out, '~');
    std::int32_t value;
    ASSERT_EQ(TEV8R1_PF_get_next_param("list", out, &value), PF_NORMAL);
    EXPECT_EQ(std::string(out, sizeof out), name + '\0' + std::string(19 - length, '~'));
  }
}

TEST_F(ListRules, StoredSizes) {
  std::int32_t bytes = -1;
  EXPECT_EQ(TEV8R1_calc_param_bytes(PF_TYPE_STRING, "abc", 5, &bytes), PF_NORMAL);
  EXPECT_EQ(bytes, 58);
  EXPECT_EQ(TEV8R1_adjust_param_size_btf(99, PF_TYPE_STRING, &bytes), PF_NORMAL);
  EXPECT_EQ(bytes, 58 - 12 + 4) << "a code that is none counts as an integer";
  EXPECT_EQ(TEV8R1_calc_param_bytes(PF_TYPE_STRING, "", INT_MAX - 49, &bytes), PF_NOMEM);
  TEVPF_PARAM record{};
  record.def.type = 16;
  expect_answer(TEV8R1_construct_param(&record, &bytes), PF_BADTYPE, {"parameter", "16"});
  expect_answer(TEV8R1_load_param_value(&record.def, nullptr), PF_BADTYPE, {"parameter", "16"});
}

TEST_F(ListRules, ValuesOfDefinitionsFromText) {
  TEVPF_PARAM_DEF def = to_c({PF_TYPE_DOUBLE, "p", "", {}, 2.5});
  EXPECT_EQ(TEV8R1_store_param_value(PF_TYPE_DOUBLE, "", &def), PF_NORMAL);
  EXPECT_EQ(def.part.f64.value + 0, 2.5) << "empty text leaves a double as it was";
  EXPECT_EQ(TEV8R1_store_param_value(PF_TYPE_INT, "42", &def), PF_NORMAL);
  EXPECT_EQ(def.part.i32.value, 42);
  expect_answer(TEV8R1_store_param_value(10, "1", &def), PF_BADTYPE, {"parameter", "10"});
  def.part.str = {-7, nullptr};
  EXPECT_EQ(TEV8R1_store_param_value(PF_TYPE_STRING, "hello", &def), PF_NORMAL);
  EXPECT_STREQ(def.part.str.value, "hello");
  EXPECT_EQ(def.part.str.length, -7);
  EXPECT_EQ(def.type, PF_TYPE_DOUBLE);
  std::free(def.part.str.value);
}

// A file's index may be out of order or its names may repeat: whatever a search in the index answers
// stays the answer, however often it is asked.
TEST_F(ListRules, DisorderedIndexIsTakenAsItStands) {
  add_numbered(40);
  save_and_reopen();
  std::swap(list("list").index_ptr[0], list("list").index_ptr[39]);
  for (int i = 0; i < 100; ++i) {
    EXPECT_EQ(TEV8R1_inq_param_exists("list", "p10"), PF_NOPARAM);
    EXPECT_EQ(TEV8R1_inq_param_exists("list", "p11"), PF_NORMAL);
  }
}

// All names begin alike but one, which belongs in front of them or behind them.
TEST_F(ListRules, ANameThatBeginsDifferentlyFindsItsPlace) {
  const std::string beginning(12, 'l');
  for (const char* other : {"a", "z", "lllm", "llla", "llllll", "\xFF"}) {
    SCOPED_TRACE(other);
    for (int i = 0; i < 80; ++i) {
      ASSERT_EQ(add({PF_TYPE_INT, beginning + std::to_string(10 + 37 * i % 80)}), PF_NORMAL);
    }
    ASSERT_EQ(add({PF_TYPE_INT, other}), PF_NORMAL);
    TEVPF_LIST* many = nullptr;
    ASSERT_EQ(tevpf::find_list("list", many), PF_NORMAL);
    EXPECT_EQ(broken_rule(*many), nullptr);
    ASSERT_EQ(TEV8R1_PF_delete_list("list"), PF_NORMAL);
    ASSERT_EQ(TEV8R1_PF_create_elem("list", "", PF_ELEM_LIST), PF_NORMAL);
  }
}

TEST_F(ListRules, TableOfNamesIsNotNeeded) {
  add_numbered(32);
  TEVPF_LIST& many = list("list");
  const auto look_up_twice = [] {  // which pays for a table of so few names
    EXPECT_EQ(TEV8R1_inq_param_exists("list", "p41"), PF_NORMAL);
    EXPECT_EQ(TEV8R1_inq_param_exists("list", "p42"), PF_NOPARAM);
  };
  tevpf::heap_fail_at(0);
  look_up_twice();
  EXPECT_TRUE(tevpf::heap_fail_off());
  EXPECT_EQ(many.names.entries, nullptr);
  look_up_twice();
  EXPECT_NE(many.names.entries, nullptr);
  EXPECT_EQ(TEV8R1_inq_param_exists("list", std::string(4000, 'p').c_str()), PF_NOPARAM);
  // A full table that cannot grow is given up; the parameter is added all the same.
  ASSERT_GT(many.free_params, 0);
  tevpf::heap_fail_at(0);
  EXPECT_EQ(add({PF_TYPE_INT, "p42"}), PF_NORMAL);
  EXPECT_TRUE(tevpf::heap_fail_off());
  EXPECT_EQ(many.names.entries, nullptr);
  EXPECT_EQ(TEV8R1_inq_param_exists("list", "p42"), PF_NORMAL);
  EXPECT_EQ(broken_rule(many), nullptr);
}

}  // namespace
