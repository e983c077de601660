// The file format: the documented example, files that end too early, files that lie.
#include <gtest/gtest.h>

#include <optional>
#include <random>

#include "core/base/heap.h"
#include "core/reader.h"
#include "lists/list_builder.h"
#include "support/definitions.h"
#include "support/drive.h"
#include "support/param_def.h"
#include "support/temp_file.h"

namespace {

// "0b 00 ..." as bytes.
std::string from_hex(const std::string& text) {
  std::istringstream in(text);
  std::string bytes;
  for (unsigned byte; in >> std::hex >> byte;) bytes += static_cast<char>(byte);
  return bytes;
}

// The example of docs/file-format.md; lines read "offset  bytes  comment", two blanks apart.
std::string example_bytes() {
  std::ifstream in(TEVPF_FORMAT_DOCUMENT);
  std::string bytes;
  bool inside = false;
  for (std::string line; std::getline(in, line);) {
    if (line.rfind("```", 0) == 0) {
      inside = line == "```hex";
    } else if (inside) {
      EXPECT_EQ(std::stoul(line.substr(0, 4), nullptr, 16), bytes.size()) << line;
      bytes += from_hex(line.substr(6, line.find("   ", 6) - 6));
    }
  }
  return bytes;
}

constexpr std::size_t kListBytes = 0xf3;     // of the example's list; its table follows
constexpr std::size_t kNameIndex = 0xeb;     // of the list
constexpr std::size_t kRowCount = 0x163;     // of the table
constexpr std::size_t kColumnIndex = 0x1e1;  // of the table
constexpr std::size_t kRows = 0x1ed;
constexpr std::size_t kHead = 108;  // an element's head
constexpr std::size_t kFirstType = kHead + 20;

class FormatTest : public LibraryTest {
 protected:
  TEVPF_STATUS open_bytes(const std::string& bytes) {
    TEV8R1_PF_close(0);
    write_file(path_, bytes);
    set_error_texts();
    return TEV8R1_PF_open(path_.c_str());
  }
  // Refused whole, a file is left alone; else what was read of it is saved as expected, where that
  // is said, and can be worked with.
  void expect_opened(const std::string& bytes, TEVPF_STATUS status, const ErrorTexts& texts,
                     const std::optional<std::string>& saved) {
    ASSERT_EQ(open_bytes(bytes), status);
    EXPECT_EQ(error_texts(), texts);
    ASSERT_EQ(current() == nullptr, status == PF_BADFILE);
    if (current() == nullptr) {
      EXPECT_EQ(read_file(path_), bytes);
      return;
    }
    if (saved) {
      EXPECT_EQ(saved_bytes(), *saved);
    }
    drive();
  }
  std::string saved_bytes() const {
    const std::string path = dir_ / "saved";
    // Some file systems flush a file that is emptied and filled again.
    std::filesystem::remove(path);
    EXPECT_EQ(TEV8R1_PF_save(path.c_str()), PF_NORMAL);
    return read_file(path);
  }
  void drive() const {
    std::mt19937 random(1);
    std::string choices(200, '\0');
    for (char& choice : choices) choice = static_cast<char>(random());
    EXPECT_NO_THROW(drive_current_file(dir_.path(), {choices}));
  }

  static const TEVPF_FILE* current() { return tevpf::library.current_file; }

  const std::string path_ = dir_ / "file";
  const std::string example_ = example_bytes();
};

TEST_F(FormatTest, AFileCutAnywhereKeepsWhatCameBefore) {
  ASSERT_EQ(example_.size(), 517u);
  const std::string list = example_.substr(0, kListBytes);
  std::string without_rows = example_.substr(0, kColumnIndex);
  without_rows.replace(kRowCount, 4, std::string(4, '\0'));
  for (std::size_t size = 0; size <= example_.size(); ++size) {
    SCOPED_TRACE(size);
    const std::string bytes = example_.substr(0, size);
    if (size == 0 || size == kListBytes || size == example_.size()) {
      expect_opened(bytes, PF_NORMAL, kUntouched, bytes);
    } else if (size < kNameIndex) {
      expect_opened(bytes, PF_BADFILE, {path_, ""}, {});
      if (size <= kFirstType) continue;
      std::string unknown = bytes;  // what is cut short is so whatever stands in it
      unknown[kFirstType] = 16;
      expect_opened(unknown, PF_BADFILE, {path_, ""}, {});
    } else if (size < kListBytes) {
      expect_opened(bytes, PF_BADFORMAT, {"list index", ""}, list);
    } else if (size < kColumnIndex) {
      const std::string name = (bytes + std::string(kHead, '\0')).c_str() + kListBytes + 4;
      expect_opened(bytes, PF_BADFORMAT, {name, ""}, list);  // as much of it as there is
    } else {
      const char* const item = size < kRows ? "HOLES index" : "table data";
      expect_opened(bytes, PF_BADFORMAT, {item, ""}, without_rows);
    }
  }
}

TEST_F(FormatTest, TextsOfAHeaderEndInTheirFields) {
  ASSERT_EQ(TEV8R1_PF_open(path_.c_str()), PF_NEWFILE);
  TEVPF_ELEM_HEADER header;
  std::memcpy(&header, example_.data(), sizeof header);
  std::fill_n(header.elem_name, sizeof header.elem_name, 'x');
  std::fill_n(header.elem_desc, sizeof header.elem_desc, 'y');
  std::FILE* const index = std::tmpfile();
  std::fwrite("\0\0\0\0\0\0\0", 1, 8, index);
  std::rewind(index);
  EXPECT_EQ(TEV8R1_format_list(header, &example_[kHead], index), PF_NORMAL);
  std::fclose(index);
  TEVPF_LIST* list;
  ASSERT_EQ(TEV8R1_get_list_ptr(std::string(19, 'x').c_str(), &list), PF_NORMAL);
  EXPECT_EQ(list->header.elem_desc, std::string(79, 'y'));
}

struct Patch {
  const char* label;
  std::size_t place;
  const char* hex;
  TEVPF_STATUS status;
  // Done: hex at that place when it is saved again; null: as patched. Else the error context's item;
  // null: the file's name.
  const char* then = nullptr;
  const char* value = "";
};

constexpr Patch kPatches[] = {
    {"element type, first", 0, "07", PF_BADFILE},
    {"element type, second", 0xf3, "07", PF_BADTYPE, "elementWEAR", "7"},
    {"btf below a list's head", 104, "0b 00 00 00", PF_BADFILE},
    {"btf below a table's head", 0x15b, "17 00 00 00", PF_BADFORMAT, "WEAR"},
    {"btf beyond the file", 0x15b, "ff ff ff 7f", PF_BADFORMAT, "WEAR"},
    {"a parameter too many", 108, "03 00 00 00", PF_BADFILE},
    {"a parameter too few", 108, "01 00 00 00", PF_BADFILE},
    {"as many as can be counted", 108, "ff ff ff 7f", PF_BADFILE},
    {"reserved bytes of a list", 112, "01 02 03 04 05 06 07 08", PF_NORMAL},
    {"reserved bytes of a parameter", 120, "01 02 03 04 05 06 07", PF_NORMAL},
    {"description elsewhere", 0x7f, "2f", PF_BADFILE},
    {"description of a string not there", 0xbd, "05", PF_BADFILE},
    {"unknown parameter type", 0xbe, "10", PF_BADTYPE, "parameter", "16"},
    {"bytes behind a name's terminator", 0xc2 + 18, "41 42", PF_NORMAL},
    {"name without terminator", 0xc2, "41 41 41 41 41 41 41 41 41 41 41 41 41 41 41 41 41 41 41 41",
     PF_NORMAL, "41 41 41 41 41 41 41 41 41 41 41 41 41 41 41 41 41 41 41 00"},
    {"two parameters of one name", 0xc2, "53 50 45 45 44", PF_NORMAL},
    {"string length negative", 0xe2, "ff ff ff ff", PF_BADFILE},
    {"string length beyond all", 0xe2, "ff ff ff 7f", PF_BADFILE},
    {"string without terminator", 0xea, "2e", PF_BADFILE},
    {"name index twice the same", 0xeb, "01 00 00 00 01 00 00 00", PF_NORMAL,
     "01 00 00 00 00 00 00 00"},
    {"name index out of range", 0xeb, "02 00 00 00 ff ff ff ff", PF_NORMAL,
     "01 00 00 00 00 00 00 00"},
    {"name index in another order", 0xeb, "00 00 00 00 01 00 00 00", PF_NORMAL},
    {"a column too many", 0x15f, "03 00 00 00", PF_BADFORMAT, "WEAR"},
    {"rows beyond the file", 0x163, "ff ff ff 7f", PF_BADFORMAT, "HOLES index"},
    {"a row too many", 0x163, "04 00 00 00", PF_BADFORMAT, "table data"},
    {"row width", 0x167, "0c 00 00 00", PF_BADFORMAT, "WEAR"},
    {"column offset", 0x1af, "05 00 00 00", PF_BADFORMAT, "WEAR"},
    {"unknown column type", 0x1b7, "09", PF_BADTYPE, "column", "9"},
    {"negative width of a number", 0x1a3, "ff ff ff ff", PF_NORMAL},
    {"negative width of a string", 0x1db, "ff ff ff ff", PF_BADFORMAT, "WEAR"},
    {"string column beyond 31 bits", 0x1db, "ff ff ff 7f", PF_BADFORMAT, "WEAR"},
    {"column description elsewhere", 0x1d7, "08", PF_BADFORMAT, "WEAR"},
    {"negative description flag", 0x19f, "f9", PF_NORMAL, "00"},
    {"spare byte", 0x1a0, "2a", PF_NORMAL},
    {"flags that are not 1", 0x1a1, "05 80", PF_NORMAL},
    {"column index twice the same", 0x1e1, "00 00 00 00 00 00 00 00", PF_NORMAL,
     "02 00 00 00 00 00 00 00"},
    {"column index in another order", 0x1e1, "00 00 00 00 02 00 00 00", PF_NORMAL},
    {"byte behind the text in a row", 0x1fc, "21", PF_NORMAL},
    {"text in a row without terminator", 0x1f4, "21", PF_NORMAL, "00"},
    {"bytes behind the last element", 517, "78", PF_BADFORMAT, ""},
};

TEST_F(FormatTest, LiesAreRefusedOrMended) {
  for (const Patch& patch : kPatches) {
    SCOPED_TRACE(patch.label);
    const auto patched = [&](const char* hex) {
      const std::string replacement = from_hex(hex);
      return std::string(example_).replace(patch.place, replacement.size(), replacement);
    };
    const std::string bytes = patched(patch.hex);
    if (patch.status == PF_NORMAL) {
      expect_opened(bytes, PF_NORMAL, kUntouched,
                    patch.then != nullptr ? patched(patch.then) : bytes);
    } else {
      const std::string item = patch.then != nullptr ? patch.then : path_;
      expect_opened(bytes, patch.status, {item, patch.value}, {});
    }
  }
  const std::string list = example_.substr(0, kListBytes);
  expect_opened(example_ + list, PF_DUPLICATE, {"list DRILL", "the file"}, example_);
  std::string bytes = example_, mended = example_;
  mended[0xe7] = bytes[0xe7] = '\0';  // "HSS8" ends behind its first letter
  mended.erase(0xe8, 3);
  mended[0xe2] = 1;
  mended[104] = 127 - 3;
  expect_opened(bytes, PF_NORMAL, kUntouched, mended);
  bytes = example_;
  bytes[kFirstType] = 16;
  expect_opened(bytes, PF_BADTYPE, {"parameter", "16"}, {});
  ASSERT_EQ(open_bytes(bytes), PF_BADTYPE);
  EXPECT_EQ(tevpf::list_at(*current(), 0).texts.begin, nullptr) << "room for texts it has not got";
}

// Without room for its values, and so for the row, nothing but the width itself is wrong.
TEST_F(FormatTest, AStringColumnOfNegativeWidthIsRefused) {
  ASSERT_EQ(TEV8R1_PF_open(path_.c_str()), PF_NEWFILE);
  ASSERT_EQ(TEV8R1_PF_create_elem("t", "", PF_ELEM_TABLE), PF_NORMAL);
  ASSERT_EQ(TEV8R1_PF_def_column("t", tevpf::col("s", tevpf::kText, 7)), PF_NORMAL);
  std::string bytes = saved_bytes();
  bytes.replace(bytes.rfind(std::string("\7\0\0\0", 4)), 4, 4, '\xff');
  bytes.replace(116, 4, 4, '\0');  // row_wid
  expect_answer(open_bytes(bytes), PF_BADFILE, {path_, ""});
}

// The default row may be larger than any memory: every other failure of the table comes first.
TEST_F(FormatTest, ADefaultRowThatCannotBeHadIsTheLastFailure) {
  ASSERT_EQ(TEV8R1_PF_open(path_.c_str()), PF_NEWFILE);
  ASSERT_EQ(TEV8R1_PF_create_elem("t", "", PF_ELEM_TABLE), PF_NORMAL);
  for (const TEVPF_COL_DEF& def :
       {tevpf::col("huge", tevpf::kText, 1 << 26), tevpf::col("n", tevpf::kInt)})
    ASSERT_EQ(TEV8R1_PF_def_column("t", def), PF_NORMAL);
  const std::string bytes = saved_bytes();
  std::string unknown = bytes, cut = bytes;
  unknown[bytes.size() - 48] = 99;  // type of the last column
  cut[112] = 1;                     // num_rows
  tevpf::heap_fail_above(1 << 20);
  expect_answer(open_bytes(unknown), PF_BADTYPE, {"column", "99"});
  expect_answer(open_bytes(cut), PF_BADFORMAT, {"table data", ""});
  expect_answer(open_bytes(bytes), PF_NOMEM, kEmpty);
  tevpf::heap_fail_above(UINT64_MAX);
}

#ifdef __GLIBC__
// A disk that fails to read on, at whatever byte, is no shorter file: it is not opened.
TEST_F(FormatTest, AReadErrorIsNoEndOfTheFile) {
  struct Disk {
    const std::string& bytes;
    std::size_t broken_from, place;
  };
  cookie_io_functions_t functions{};
  functions.read = [](void* cookie, char* to, std::size_t count) -> ssize_t {
    Disk& disk = *static_cast<Disk*>(cookie);
    count = std::min({count, std::size_t{7}, disk.broken_from - disk.place});
    std::copy_n(disk.bytes.data() + disk.place, count, to);
    disk.place += count;
    if (count != 0) return static_cast<ssize_t>(count);
    errno = EIO;
    return -1;
  };
  for (std::size_t from = 0; from <= example_.size(); ++from) {
    Disk disk{example_, from, 0};
    ASSERT_EQ(TEV8R1_add_file(fopencookie(&disk, "rb", functions), "name", 0), PF_NORMAL);
    expect_answer(tevpf::load_file(*tevpf::library.current_file), PF_OPENFAIL, {"name", ""});
    ASSERT_EQ(current(), nullptr) << from;
  }
}
#endif

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
    ASSERT_EQ(current() == nullptr, n == 0);
    if (n > 0) drive();
    if (!failed) break;
  }
}

TEST(ArrayTest, GrowsBehindWhatItHolds) {
  void *array = nullptr, *first_new = nullptr;
  ASSERT_EQ(TEV8R1_allocate_elem(0, 8, 1, &array, &first_new), PF_NORMAL);
  char* const before = static_cast<char*>(array);
  EXPECT_EQ(std::string(before, 8), std::string(8, '\0'));
  std::strcpy(before, "abcdefg");
  EXPECT_EQ(TEV8R1_memcpy(5, before, before + 2), PF_NORMAL);
  EXPECT_EQ(TEV8R1_allocate_elem(8, -9, 1, &array, &first_new), PF_NOMEM);
  ASSERT_EQ(TEV8R1_allocate_elem(8, 100'000, 1, &array, &first_new), PF_NORMAL);
  EXPECT_EQ(first_new, static_cast<char*>(array) + 8);
  EXPECT_STREQ(static_cast<char*>(array), "ababcde");
  std::free(array);
}

}  // namespace
