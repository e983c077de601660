// What must hold for every exported operation: nothing is lost when memory runs out at any of its
// requests, and no integer argument, however extreme, breaks anything.
#include "robustness/operations.h"

#include <fstream>

#include "core/base/heap.h"
#include "core/library.h"
#include "support/drive.h"

namespace {

constexpr std::uint64_t kLargestBlock = 1 << 20;  // enough for the files at hand

class OperationsTest : public LibraryTest {
 protected:
  OperationsTest() {
    start();
    EXPECT_EQ(TEV8R1_PF_save((dir_ / "other").c_str()), PF_NORMAL);
  }
  void start() const {
    close_all();
    for (const char* name : {"file", "new"}) std::remove((dir_ / name).c_str());
    ASSERT_EQ(TEV8R1_PF_open((dir_ / "file").c_str()), PF_NEWFILE);
    ASSERT_NO_FATAL_FAILURE(make_elements());
  }
};

TEST_F(OperationsTest, TheTableNamesEveryExportedOperation) {
  std::set<std::string> listed, tested;
  std::ifstream list(TEVPF_OPERATIONS);
  for (std::string name; std::getline(list, name);) listed.insert(name);
  for (const Call& call : all_calls(dir_)) tested.insert(std::string("TEV8R1_") + call.operation);
  EXPECT_EQ(tested, listed);
  EXPECT_FALSE(listed.empty());
}

// The first thing that operations check: the current file, and then the element in it.
TEST_F(OperationsTest, ElementsAreThoseOfTheCurrentFile) {
  int without_file = 0, without_element = 0;
  for (const Call& call : all_calls(dir_)) {
    const std::string_view operation = call.operation, arguments = call.arguments;
    SCOPED_TRACE(testing::Message() << operation << arguments);
    const bool of_list = arguments.starts_with("(\"list\"");
    const bool of_table = arguments.starts_with("(\"t\"");
    const bool of_file = operation.starts_with("PF_") && operation != "PF_init" &&
                         operation != "PF_open" && operation != "PF_set_memory_allocation";
    if (call.leeway == kNoStatus || arguments.empty()) continue;
    close_all();
    set_error_texts();
    if (of_file || of_list || of_table) {
      expect_answer(call.run(call.numbers.data()), PF_NOFILE,
                    operation == "PF_dump_file" ? kUntouched : kEmpty);
      ++without_file;
    }
    if ((!of_list && !of_table) || operation == "check_list_unique") continue;
    ASSERT_EQ(TEV8R1_PF_open((dir_ / "new").c_str()), PF_NEWFILE);
    expect_answer(call.run(call.numbers.data()), PF_NOELEM,
                  of_list ? ErrorTexts{"list", "list"} : ErrorTexts{"table", "t"});
    EXPECT_EQ(tevpf::library.interactive, 0);
    ++without_element;
  }
  EXPECT_GT(without_file, 100);
  EXPECT_GT(without_element, 80);
}

// Every build writes the bytes of the stored file: 64-bit, 32-bit, with and without sanitizers.
TEST_F(OperationsTest, TheFileIsTheSameFromEveryBuild) {
  EXPECT_TRUE(read_file(dir_ / "other") == read_file(TEVPF_ELEMENTS_FILE));
}

// Leaves the settled state, as changes in the middle of a long list do.
void unsettle(TEVPF_LIST& list) {
  if (list.num_params == 0) return;
  for (tevpf::Sequence* sequence : {&list.slots.order, &list.index.order}) {
    *sequence = {nullptr, tevpf::SequenceBlocks::make(sequence->items, list.num_params), 0};
  }
  list.index_ptr = nullptr;
}
// The same of every sequence of a table.
void unsettle(TEVPF_TABLE& table) {
  const auto leave = [&](tevpf::Sequence& sequence) {
    EXPECT_TRUE(sequence.make_ready_to_move(table.num_rows, 0, table.num_rows - 1));
  };
  if (table.num_rows < 2) return;
  leave(table.slots.order);
  for (TEVPF_COLUMN& column : std::span(table.col_array, table.num_cols)) {
    if (column.def.idx_flag != 0) leave(column.index);
  }
}
void unsettle_elements() {
  const TEVPF_FILE& file = *tevpf::library.current_file;
  for (int i = 0; i < tevpf::directory_of(file, PF_ELEM_LIST).count; ++i)
    unsettle(tevpf::list_at(file, i));
  for (int i = 0; i < tevpf::directory_of(file, PF_ELEM_TABLE).count; ++i)
    unsettle(tevpf::table_at(file, i));
}

// Each request of each operation fails once: it says so, nothing but spare slots has changed, and the same
// call then succeeds as if nothing had been; or it can do without and nobody notices.
TEST_F(OperationsTest, EveryRequestForMemoryFailsOnce) {
  int requests = 0;
  for (const Call& call : all_calls(dir_)) {
    if (call.leeway == kNumbersOnly) continue;
    start();
    const TEVPF_STATUS usual = call.run(call.numbers.data());
    const std::string usual_state = snapshot(true), usual_text = read_text(dir_ / "text");
    bool settled = true;  // then once more for elements that are not
    for (std::int64_t n = 0;; ++n) {
      SCOPED_TRACE(testing::Message() << call.operation << ", request " << n << ", " << settled);
      start();
      const std::string before = snapshot(false);
      if (!settled) unsettle_elements();
      set_error_texts();
      tevpf::heap_fail_at(n);
      TEVPF_STATUS status = call.run(call.numbers.data());
      if (!tevpf::heap_fail_off()) {
        // These calls write an element first, which settles it.
        if (!settled || std::string_view(call.operation).starts_with("format_")) break;
        settled = false;
        n = -1;
        continue;
      }
      ++requests;
      EXPECT_EQ(broken_rules(), "");
      if (status == PF_NOMEM) {
        EXPECT_EQ(error_texts(), kEmpty);
        EXPECT_FALSE(std::filesystem::exists(dir_ / "new"));
        std::string text = read_text(dir_ / "text");  // a report ends where it could not go on
        const std::string end = "!\n\f\n";            // of each element in a file's dump
        if (text.ends_with(end)) text.resize(text.size() - end.size());
        EXPECT_EQ(text, usual_text.substr(0, text.size()));
        if (call.leeway == kPartStays) continue;
        EXPECT_TRUE(snapshot(false) == before);
        status = call.run(call.numbers.data());
      }
      EXPECT_EQ(status, usual);
      EXPECT_TRUE(snapshot(true) == usual_state);
      if (HasFailure()) return;
    }
  }
  EXPECT_GT(requests, 300);
}

// A refusal changes nothing but spare slots; what was accepted can be saved and read back.
TEST_F(OperationsTest, ExtremeNumbersEverywhere) {
  const std::int32_t extremes[] = {INT32_MIN, INT16_MIN, INT8_MIN,      -1,       0, 1,
                                   INT8_MAX,  INT16_MAX, INT32_MAX - 1, INT32_MAX};
  for (const Call& call : all_calls(dir_)) {
    for (std::size_t argument = 0; argument < call.numbers.size(); ++argument) {
      for (const std::int32_t extreme : extremes) {
        SCOPED_TRACE(testing::Message() << call.operation << argument << " = " << extreme);
        start();
        const std::string before = snapshot(false);
        std::vector<std::int32_t> numbers = call.numbers;
        numbers[argument] = extreme;
        tevpf::heap_fail_above(kLargestBlock);
        const TEVPF_STATUS status = call.run(numbers.data());
        tevpf::heap_fail_above(UINT64_MAX);
        EXPECT_EQ(broken_rules(), "");
        if (call.leeway == kNoStatus) continue;
        EXPECT_EQ(status & 0xFFFF8000u, 0x09608000u);
        const auto severity = status & 7u;
        const bool refused = severity == TEVPF_SEVERITY_ERROR || severity == TEVPF_SEVERITY_WARNING;
        const bool any_file = tevpf::library.current_file != nullptr;
        EXPECT_TRUE(!refused || call.leeway != kNone || snapshot(false) == before);
        EXPECT_TRUE(refused || !any_file || save_and_compare(dir_.path()));
        if (HasFailure()) return;
      }
    }
  }
}

}  // namespace
