// A new parameter file in a directory of its own, and short ways to fill it and to read reports.
#pragma once

#include <gtest/gtest.h>

#include <sstream>
#include <string>
#include <variant>
#include <vector>

#include "core/error_context.h"
#include "support/param_def.h"
#include "support/table_fixture.h"
#include "support/temp_file.h"

namespace tevpf {

using Value = std::variant<double, std::string>;

inline std::string golden(const std::string& name) {
  return read_file(std::string(TEVPF_GOLDEN_DIR) + name + ".golden");
}

class ReportTest : public ::testing::Test {
 protected:
  void SetUp() override {
    std::filesystem::current_path(dir_.path());
    unsetenv("TEV8R1_debug");
    TEV8R1_PF_init();
    ASSERT_EQ(TEV8R1_PF_open("report.pf"), PF_NEWFILE);
  }
  void TearDown() override {
    unsetenv("TEV8R1_debug");
    TEV8R1_PF_init();
    while (TEV8R1_PF_close(0) == PF_NORMAL) {
    }
    std::filesystem::current_path(std::filesystem::temp_directory_path());
  }

  static void list(const char* name, const char* description) {
    ASSERT_EQ(TEV8R1_PF_create_elem(name, description, PF_ELEM_LIST), PF_NORMAL);
    list_ = name;
  }
  // Parameters at the end of the last list.
  static void add(const Def& def) {
    const TEVPF_PARAM_DEF c = to_c(def);
    ASSERT_EQ(TEV8R1_PF_add_param(list_, &c, PF_END_POS), PF_NORMAL) << err_item;
  }
  static void number(const char* name, const char* units, std::int32_t type, double max, double min,
                     double value, std::optional<std::string> description = {},
                     std::int32_t precision = 1) {
    add({type, name, units, description, value, max, min, precision});
  }
  static void text(const char* name, const char* value, std::optional<std::string> description = {},
                   const char* units = "") {
    add({PF_TYPE_STRING, name, units, description, 0, 0, 0, 0, value});
  }

  static void table(const char* name, const char* description) {
    ASSERT_EQ(TEV8R1_PF_create_elem(name, description, PF_ELEM_TABLE), PF_NORMAL);
    ASSERT_EQ(TEV8R1_get_table_ptr(name, &table_), PF_NORMAL);
  }
  // Columns at the end of the last table.
  enum Index { kNone, kIndexed, kUnique };
  static void number_column(const char* name, std::int32_t type, std::int32_t width, double max,
                            double min, Index index = kNone, const char* description = nullptr,
                            std::int32_t precision = 1, const char* units = "") {
    TEVPF_COL_DEF def = described(col(name, type, width, {min, max, precision}), description);
    std::strcpy(def.units, units);
    if (index != kNone) def = indexed(def, index == kUnique);
    ASSERT_EQ(TEV8R1_PF_def_column(table_->header.elem_name, def), PF_NORMAL) << err_item;
  }
  static void text_column(const char* name, std::int32_t width, const char* units = "") {
    number_column(name, PF_TYPE_STRING, width, 0, 0, kNone, nullptr, 1, units);
  }
  // A row at the end of the last table, a value for each column.
  static void row(const std::vector<Value>& values) {
    std::vector<char> bytes(static_cast<std::size_t>(table_->row_wid));
    for (std::size_t n = 0; n < values.size(); ++n) {
      const TEVPF_COLUMN& at = table_->col_array[n];
      char* const place = bytes.data() + at.offset;
      if (const std::string* text = std::get_if<std::string>(&values[n])) {
        std::memcpy(place, text->c_str(), text->size() + 1);
      } else {
        with_number(at.def.type, [&](auto tag) {
          store(place, static_cast<decltype(tag)>(std::get<double>(values[n])));
        });
      }
    }
    ASSERT_EQ(TEV8R1_PF_add_row(table_->header.elem_name, bytes.data()), PF_NORMAL) << err_item;
  }

  static std::string dump_table() {
    EXPECT_EQ(TEV8R1_PF_dump_table(table_->header.elem_name, "out.txt"), PF_NORMAL);
    return read_file("out.txt");
  }
  static std::string listing(const std::vector<std::string>& names, std::int32_t first = 0,
                             std::int32_t last = PF_END_POS, std::int32_t definitions = 0) {
    std::vector<char> fields(names.size() * TEVPF_NAME_SIZE + 1);
    for (std::size_t n = 0; n < names.size(); ++n) {
      std::memcpy(&fields[n * TEVPF_NAME_SIZE], names[n].data(), names[n].size());
    }
    status_ = TEV8R1_PF_print_table(
        table_->header.elem_name, "out.txt", definitions, static_cast<std::int32_t>(names.size()),
        reinterpret_cast<const char(*)[TEVPF_NAME_SIZE]>(fields.data()), first, last);
    return read_file("out.txt");
  }
  // What stands behind the heading of the rows' block.
  static std::string data_of(const std::string& report) {
    const std::string heading = "TABLE DATA\n\n";
    return report.substr(report.find(heading) + heading.size());
  }

  // One of everything: the file behind golden/file, and a table with many kinds of columns.
  static void fill_lists();
  static void fill_mixed_table();

  inline static const char* list_ = nullptr;
  inline static TEVPF_TABLE* table_ = nullptr;
  inline static TEVPF_STATUS status_ = PF_NORMAL;

 private:
  TempDir dir_;
};

inline void ReportTest::fill_lists() {
  const std::string notes(91, 'a');
  list("TEVPF_FILE_HEADER", "about the file");
  text("Author", "100% engineered");
  text("Notes", notes.c_str());
  number("Revision", "", PF_TYPE_INT, 9, 0, 7);
  number("Scale", "", PF_TYPE_REAL, 1, 0, 0.25);

  list("Empty", "nothing in it");

  list("Plain", "100%s");
  number("count", "pcs", PF_TYPE_INT, 100, -100, 42);
  number("level", "", PF_TYPE_SHORT, 32767, -32768, -5);
  number("pi", "rad", PF_TYPE_REAL, 10, 0, 3.14159, {}, 3);
  number("far", "", PF_TYPE_DOUBLE, 1e300, -1e300, 1e-7, {}, 6);
  text("tabbed", "a\tb\n");
  text("blank", "ends ");
  text("empty", "");

  const std::string value(66, 'v');
  list("Described", "");
  text("eleven", "1234567890\t", "fits");
  text("twelve", "123456789012", "moves");
  text("silent", "x");
  text("long", value.c_str(), std::string(60, 'd').c_str(), "m");
  number("n%d", "%s", PF_TYPE_INT, INT32_MAX, INT32_MIN, INT32_MIN, "50% of\t%s");
  number("half", "", PF_TYPE_DOUBLE, 1, 0, 0.5, {}, 1200);
}

inline void ReportTest::fill_mixed_table() {
  const std::string wide(55, 'a');
  table("Mixed", "stored 30, 10, 20");
  number_column("id", PF_TYPE_INT, 5, 9999, -9999, kUnique, "identifier");
  text_column("a_rather_long_name", 4, "m/s");
  number_column("x", PF_TYPE_REAL, 8, 1e6, -1e6, kIndexed, wide.c_str(), 3);
  number_column("y", PF_TYPE_DOUBLE, 1, 1e300, -1e300, kNone, nullptr, 50, "%");
  number_column("s", PF_TYPE_SHORT, 3, 32767, -32768);
  text_column("t", 6);
  row({30.0, "ab\n", 1.5, 0.25, 7.0, "end "});
  row({10.0, "", -0.0001, 0.1, -32768.0, ""});
  row({20.0, "x\\y", 123456.0, 2.0, 5.0, "%d"});
}

}  // namespace tevpf
