// The file format: the documented example, files that end too early, files that lie.
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdint>
#include <cstring>

#include "core/heap.h"
#include "core/reader.h"
#include "example_file.h"
#include "support/error_texts.h"

namespace {

class FormatTest : public testing::Test {
 protected:
  FormatTest() { TEV8R1_PF_init(); }
  ~FormatTest() override {
    while (TEV8R1_PF_close(0) == PF_NORMAL) {
    }
  }

  TEVPF_STATUS open_bytes(const std::string& bytes) {
    write_file(dir_ / "file", bytes);
    set_error_texts();
    return TEV8R1_PF_open((dir_ / "file").c_str());
  }

  static const TEVPF_FILE* current() { return tevpf::library.current_file; }

  TempDir dir_;
  const std::string example_ = example_bytes();
};

TEVPF_PARAM_DEF param(const char* name, std::int32_t type, const char* units, const char* desc) {
  TEVPF_PARAM_DEF def{};
  def.type = type;
  std::strcpy(def.name, name);
  std::strcpy(def.units, units);
  def.description = const_cast<char*>(desc);
  return def;
}

TEST_F(FormatTest, ElementsOfTheExampleAreWrittenAsDocumented) {
  ASSERT_EQ(example_.size(), 517u);
  ASSERT_EQ(TEV8R1_PF_open((dir_ / "new").c_str()), PF_NEWFILE);
  ASSERT_EQ(TEV8R1_PF_create_elem("WEAR", "", PF_ELEM_TABLE), PF_NORMAL);
  ASSERT_EQ(TEV8R1_PF_create_elem("DRILL", "One drill", PF_ELEM_LIST), PF_NORMAL);
  TEVPF_PARAM_DEF speed = param("SPEED", PF_TYPE_INT, "1/min", "fixed");
  speed.part.i32 = {1200, 3000, -1};
  TEVPF_PARAM_DEF make = param("MAKE", PF_TYPE_STRING, "", nullptr);
  char text[] = "HSS8";
  make.part.str.value = text;
  ASSERT_EQ(TEV8R1_PF_add_param("DRILL", &make, PF_END_POS), PF_NORMAL);
  ASSERT_EQ(TEV8R1_PF_add_param("DRILL", &speed, 0), PF_NORMAL);
  TEVPF_COL_DEF holes{}, state{};
  holes.type = PF_TYPE_INT;
  std::strcpy(holes.name, "HOLES");
  holes.idx_flag = holes.unq_flag = 1;
  holes.width = 6;
  holes.limits.i32 = {100, 0};
  state.type = PF_TYPE_STRING;
  std::strcpy(state.name, "STATE");
  state.width = 3;
  char unknown[] = "?";
  state.description = unknown;
  ASSERT_EQ(TEV8R1_PF_def_column("WEAR", holes), PF_NORMAL);
  ASSERT_EQ(TEV8R1_PF_def_column("WEAR", state), PF_NORMAL);
  for (std::size_t row = 0; row < 3; ++row) {
    ASSERT_EQ(TEV8R1_PF_add_row("WEAR", example_.data() + kRows + 8 * row), PF_NORMAL);
  }
  EXPECT_EQ(saved_bytes(dir_), example_);
  ASSERT_EQ(TEV8R1_PF_close(1), PF_NORMAL);
  EXPECT_EQ(read_file(dir_ / "new"), example_);
}

TEST_F(FormatTest, TheExampleIsReadAndWrittenBack) {
  ASSERT_EQ(open_bytes(example_), PF_NORMAL);
  EXPECT_EQ(error_texts(), kUntouched);
  EXPECT_EQ(saved_bytes(dir_), example_);
  std::int32_t speed = 0;
  ASSERT_EQ(TEV8R1_PF_get_param_value("DRILL", "SPEED", &speed), PF_NORMAL);
  EXPECT_EQ(speed, 1200);
  ASSERT_EQ(TEV8R1_PF_define_table_search("WEAR", "HOLES"), PF_NORMAL);
  std::string rows, row(8, 'x');
  while (TEV8R1_PF_get_next_row("WEAR", row.data()) == PF_NORMAL) rows += row;
  const std::string stored = example_.substr(kRows);
  EXPECT_EQ(rows, stored.substr(16, 8) + stored.substr(0, 16));
  drive_current_file(dir_);
}

// What opening the first `size` bytes of the example must say.
struct Expected {
  TEVPF_STATUS status;
  std::string item;
};
Expected cut_outcome(const std::string& bytes, std::size_t size) {
  if (size == 0 || size == kListBytes || size == bytes.size()) return {PF_NORMAL, ""};
  if (size < kNameIndex) return {PF_BADFILE, ""};
  if (size < kListBytes) return {PF_BADFORMAT, "list index"};
  if (size >= kRows) return {PF_BADFORMAT, "table data"};
  if (size >= kColumnIndex) return {PF_BADFORMAT, "HOLES index"};
  // As much of the name as there is.
  const std::string read = bytes.substr(0, size) + std::string(kHead, '\0');
  return {PF_BADFORMAT, read.c_str() + kListBytes + 4};
}

TEST_F(FormatTest, AFileCutAnywhereKeepsWhatCameBefore) {
  for (std::size_t size = 0; size <= example_.size(); ++size) {
    SCOPED_TRACE(size);
    Expected expected = cut_outcome(example_, size);
    ASSERT_EQ(open_bytes(example_.substr(0, size)), expected.status);
    if (expected.status == PF_BADFILE) {
      EXPECT_EQ(error_texts(), (ErrorTexts{dir_ / "file", ""}));
      EXPECT_EQ(current(), nullptr);
      EXPECT_EQ(read_file(dir_ / "file").size(), size);  // it is not deleted
      continue;
    }
    EXPECT_EQ(error_texts(),
              expected.status == PF_NORMAL ? kUntouched : (ErrorTexts{expected.item, ""}));
    ASSERT_NE(current(), nullptr);
    EXPECT_EQ(current()->num_lists, size >= kNameIndex ? 1 : 0);
    EXPECT_EQ(current()->num_tables, size >= kColumnIndex ? 1 : 0);
    drive_current_file(dir_);
    ASSERT_EQ(TEV8R1_PF_close(0), PF_NORMAL);
  }
}

struct Patch {
  const char* label;
  std::size_t place;
  const char* hex;
  TEVPF_STATUS status;
  const char* item;  // null: nothing is written (PF_BADFILE: the file's name)
  const char* value;
  const char* saved;  // hex at that place when it is saved again; null: as it was patched
};

constexpr Patch kPatches[] = {
    {"element type, first", 0, "07", PF_BADFILE, nullptr, "", nullptr},
    {"element type, second", 0xf3, "07", PF_BADTYPE, "elementWEAR", "7", nullptr},
    {"btf below a list's head", 104, "0b 00 00 00", PF_BADFILE, nullptr, "", nullptr},
    {"btf negative", 0x15b, "ff ff ff ff", PF_BADFORMAT, "WEAR", "", nullptr},
    {"btf below a table's head", 0x15b, "17 00 00 00", PF_BADFORMAT, "WEAR", "", nullptr},
    {"btf beyond the file", 0x15b, "ff ff ff 7f", PF_BADFORMAT, "WEAR", "", nullptr},
    {"a parameter too many", 108, "03 00 00 00", PF_BADFILE, nullptr, "", nullptr},
    {"a parameter too few", 108, "01 00 00 00", PF_BADFILE, nullptr, "", nullptr},
    {"as many as can be counted", 108, "ff ff ff 7f", PF_BADFILE, nullptr, "", nullptr},
    {"negative count of parameters", 108, "ff ff ff ff", PF_BADFILE, nullptr, "", nullptr},
    {"reserved bytes of a list", 112, "01 02 03 04 05 06 07 08", PF_NORMAL, nullptr, "", nullptr},
    {"reserved bytes of a parameter", 120, "01 02 03 04 05 06 07", PF_NORMAL, nullptr, "", nullptr},
    {"description elsewhere", 0x7f, "2f", PF_BADFILE, nullptr, "", nullptr},
    {"description before the record", 0x7f, "80", PF_BADFILE, nullptr, "", nullptr},
    {"description of a string not there", 0xbd, "05", PF_BADFILE, nullptr, "", nullptr},
    {"unknown parameter type", 0xbe, "10", PF_BADTYPE, "parameter", "16", nullptr},
    {"name without terminator", 0xc2 + 19, "41", PF_NORMAL, nullptr, "", "00"},
    {"string length negative", 0xe2, "ff ff ff ff", PF_BADFILE, nullptr, "", nullptr},
    {"string length beyond all", 0xe2, "ff ff ff 7f", PF_BADFILE, nullptr, "", nullptr},
    {"string without terminator", 0xea, "2e", PF_BADFILE, nullptr, "", nullptr},
    {"name index twice the same", 0xeb, "01 00 00 00 01 00 00 00", PF_NORMAL, nullptr, "",
     "01 00 00 00 00 00 00 00"},
    {"name index out of range", 0xeb, "02 00 00 00 ff ff ff ff", PF_NORMAL, nullptr, "",
     "01 00 00 00 00 00 00 00"},
    {"name index in another order", 0xeb, "00 00 00 00 01 00 00 00", PF_NORMAL, nullptr, "",
     nullptr},
    {"a column too many", 0x15f, "03 00 00 00", PF_BADFORMAT, "WEAR", "", nullptr},
    {"rows beyond the file", 0x163, "ff ff ff 7f", PF_BADFORMAT, "HOLES index", "", nullptr},
    {"a row too many", 0x163, "04 00 00 00", PF_BADFORMAT, "table data", "", nullptr},
    {"row width", 0x167, "0c 00 00 00", PF_BADFORMAT, "WEAR", "", nullptr},
    {"column offset", 0x1af, "05 00 00 00", PF_BADFORMAT, "WEAR", "", nullptr},
    {"unknown column type", 0x1b7, "09", PF_BADTYPE, "column", "9", nullptr},
    {"negative width of a number", 0x1a3, "ff ff ff ff", PF_NORMAL, nullptr, "", nullptr},
    {"negative width of a string", 0x1db, "ff ff ff ff", PF_BADFORMAT, "WEAR", "", nullptr},
    {"string column beyond 31 bits", 0x1db, "ff ff ff 7f", PF_BADFORMAT, "WEAR", "", nullptr},
    {"column description elsewhere", 0x1d7, "08", PF_BADFORMAT, "WEAR", "", nullptr},
    {"negative description flag", 0x19f, "f9", PF_NORMAL, nullptr, "", "00"},
    {"spare byte", 0x1a0, "2a", PF_NORMAL, nullptr, "", nullptr},
    {"flags that are not 1", 0x1a1, "05 80", PF_NORMAL, nullptr, "", nullptr},
    {"unique without index", 0x1d9, "00 01", PF_NORMAL, nullptr, "", nullptr},
    {"column index twice the same", 0x1e1, "00 00 00 00 00 00 00 00", PF_NORMAL, nullptr, "",
     "02 00 00 00 00 00 00 00"},
    {"column index in another order", 0x1e1, "00 00 00 00 02 00 00 00", PF_NORMAL, nullptr, "",
     nullptr},
    {"text in a row without terminator", 0x1f4, "21", PF_NORMAL, nullptr, "", "00"},
};

TEST_F(FormatTest, LiesAreRefusedOrMended) {
  for (const Patch& patch : kPatches) {
    SCOPED_TRACE(patch.label);
    const std::string hex = from_hex(patch.hex);
    std::string bytes = example_, mended = example_;
    bytes.replace(patch.place, hex.size(), hex);
    ASSERT_EQ(open_bytes(bytes), patch.status);
    const std::string item = patch.item != nullptr        ? patch.item
                             : patch.status == PF_BADFILE ? dir_ / "file"
                                                          : "";
    EXPECT_EQ(error_texts(),
              patch.status == PF_NORMAL ? kUntouched : (ErrorTexts{item, patch.value}));
    ASSERT_EQ(current() == nullptr, patch.status == PF_BADFILE);
    if (current() == nullptr) continue;
    if (patch.status == PF_NORMAL) {
      const std::string saved = patch.saved != nullptr ? from_hex(patch.saved) : hex;
      EXPECT_EQ(saved_bytes(dir_), mended.replace(patch.place, saved.size(), saved));
    }
    drive_current_file(dir_);
    ASSERT_EQ(TEV8R1_PF_close(0), PF_NORMAL);
  }
}

TEST_F(FormatTest, HalfElementsAreWholeAgain) {
  std::string bytes = example_;
  bytes[0xe7] = '\0';  // "HSS8" ends behind its first letter
  ASSERT_EQ(open_bytes(bytes), PF_NORMAL);
  TEVPF_LIST* list = nullptr;
  ASSERT_EQ(TEV8R1_get_list_ptr("DRILL", &list), PF_NORMAL);
  EXPECT_EQ(list->header.btf, 127 - 3);
  EXPECT_EQ(list->param_ptr[1].def.part.str.length, 1);
  ASSERT_EQ(TEV8R1_PF_close(0), PF_NORMAL);

  bytes = example_;
  bytes[0xbe] = 16;  // the second parameter's type
  ASSERT_EQ(open_bytes(bytes), PF_BADTYPE);
  ASSERT_EQ(TEV8R1_get_list_ptr("DRILL", &list), PF_NORMAL);
  EXPECT_EQ(list->num_params, 1);
  EXPECT_EQ(list->header.btf, 12 + 62);
  EXPECT_EQ(list->index_ptr[0], 0);
  ASSERT_EQ(TEV8R1_PF_close(0), PF_NORMAL);

  ASSERT_EQ(open_bytes(example_.substr(0, kRows + 9)), PF_BADFORMAT);
  TEVPF_TABLE* table = nullptr;
  ASSERT_EQ(TEV8R1_get_table_ptr("WEAR", &table), PF_NORMAL);
  EXPECT_EQ(table->num_cols, 2);
  EXPECT_EQ(table->num_rows, 0);
}

TEST_F(FormatTest, NamesOccurOnceAndOrderIsKept) {
  const std::string list = example_.substr(0, kListBytes), table = example_.substr(kListBytes);
  ASSERT_EQ(open_bytes(table + list), PF_NORMAL);  // in any order
  EXPECT_EQ(saved_bytes(dir_), example_);
  ASSERT_EQ(TEV8R1_PF_close(0), PF_NORMAL);
  ASSERT_EQ(open_bytes(example_ + list), PF_DUPLICATE);
  EXPECT_EQ(error_texts(), (ErrorTexts{"list DRILL", "the file"}));
  drive_current_file(dir_);
  ASSERT_EQ(TEV8R1_PF_close(0), PF_NORMAL);
  ASSERT_EQ(open_bytes(example_ + "x"), PF_BADFORMAT);
  EXPECT_EQ(error_texts(), kEmpty);
}

TEST_F(FormatTest, TwoParametersOfOneNameAreBothKept) {
  std::string bytes = example_;
  bytes.replace(0xc2, 6, std::string("SPEED\0", 6));
  ASSERT_EQ(open_bytes(bytes), PF_NORMAL);
  drive_current_file(dir_);
}

// What was loaded before memory ran out stays, and can be worked with.
TEST_F(FormatTest, HalfAFileIsWholeElements) {
  std::string bytes = example_;
  bytes.replace(kColumnIndex, 4, std::string(4, '\0'));  // an index to be built again
  for (int n = 0;; ++n) {
    SCOPED_TRACE(n);
    tevpf::heap_fail_at(n);
    const TEVPF_STATUS status = open_bytes(bytes);
    const bool failed = tevpf::heap_fail_off();
    EXPECT_EQ(status, failed ? PF_NOMEM : PF_NORMAL);
    EXPECT_EQ(error_texts(), failed ? kEmpty : kUntouched);
    if (n == 0) {
      EXPECT_EQ(current(), nullptr);
      continue;
    }
    drive_current_file(dir_);
    ASSERT_EQ(TEV8R1_PF_close(0), PF_NORMAL);
    if (!failed) break;
  }
}

// Bodies and rows larger than any buffer on the way.
TEST_F(FormatTest, LargeElementsAreReadWhole) {
  const std::string text(300'000, 'x');
  ASSERT_EQ(TEV8R1_PF_open((dir_ / "large").c_str()), PF_NEWFILE);
  ASSERT_EQ(TEV8R1_PF_create_elem("L", "", PF_ELEM_LIST), PF_NORMAL);
  TEVPF_PARAM_DEF def = param("TEXT", PF_TYPE_STRING, "", text.c_str());
  def.part.str.value = const_cast<char*>(text.c_str());
  ASSERT_EQ(TEV8R1_PF_add_param("L", &def, 0), PF_NORMAL);
  ASSERT_EQ(TEV8R1_PF_create_elem("T", "", PF_ELEM_TABLE), PF_NORMAL);
  TEVPF_COL_DEF column{};
  column.type = PF_TYPE_INT;
  column.idx_flag = 1;
  column.width = 6;
  column.limits.i32 = {INT32_MAX, 0};
  ASSERT_EQ(TEV8R1_PF_def_column("T", column), PF_NORMAL);
  for (std::int32_t i = 0; i < 100'000; ++i) {
    ASSERT_EQ(TEV8R1_PF_add_row("T", &i), PF_NORMAL);
  }
  EXPECT_NO_THROW(drive_current_file(dir_.path(), {}));
  // From a stream that does not say how long it is.
  const std::string bytes = saved_bytes(dir_), fifo = dir_ / "fifo";
  ASSERT_EQ(mkfifo(fifo.c_str(), 0600), 0);
  const pid_t writer = fork();
  if (writer == 0) {
    write_file(fifo, bytes);
    _exit(0);
  }
  std::FILE* stream = std::fopen(fifo.c_str(), "rb");
  ASSERT_EQ(TEV8R1_add_file(stream, "pipe", 1), PF_NORMAL);
  EXPECT_EQ(tevpf::load_file(*tevpf::library.current_file), PF_NORMAL);
  EXPECT_EQ(saved_bytes(dir_), bytes);
  waitpid(writer, nullptr, 0);
}

TEST(ArrayTest, GrowsOrStays) {
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
