// Lists, and tables with many kinds of columns, in a new file; and short ways to read reports of them.
#pragma once

#include <array>
#include <filesystem>

#include "support/param_def.h"
#include "support/table_fixture.h"

namespace tevpf {

// A report as it is stored; what differs from run to run stands in it as a mark.
inline std::string golden(const std::string& name, const std::string& for_mark = "") {
  std::string text = read_file(std::string(TEVPF_GOLDEN_DIR) + name + ".golden");
  const std::string mark = "<MARK>";
  if (const auto at = text.find(mark); at != text.npos) text.replace(at, mark.size(), for_mark);
  return text;
}

class ReportTest : public TableTest {
 protected:
  ReportTest() { std::filesystem::current_path(dir_.path()); }
  ~ReportTest() override {
    unsetenv("TEV8R1_debug");
    TEV8R1_PF_init();
    std::filesystem::current_path(std::filesystem::temp_directory_path());
  }

  static void new_list(const char* name, const char* description, const std::vector<Def>& params) {
    ASSERT_OK(TEV8R1_PF_create_elem(name, description, PF_ELEM_LIST));
    for (const Def& def : params) {
      const TEVPF_PARAM_DEF c = to_c(def);
      ASSERT_OK(TEV8R1_PF_add_param(name, &c, PF_END_POS)) << def.name;
    }
  }

  static void add_rows(const std::vector<std::vector<const char*>>& rows) {
    for (const auto& values : rows) {
      std::string row(static_cast<std::size_t>(table().row_wid), '\x55');
      for (int i = 0; i < table().num_cols; ++i) {
        char* place = &row[static_cast<std::size_t>(column(i).offset)];
        ASSERT_OK(TEV8R1_from_char(column(i).def.type, values[static_cast<std::size_t>(i)], place));
      }
      ASSERT_OK(TEV8R1_PF_add_row("t", row.data()));
    }
  }

  static void mixed_table() {
    TEV8R1_PF_delete_table("t");
    ASSERT_OK(TEV8R1_PF_create_elem("t", "stored 30, 10, 20", PF_ELEM_TABLE));
    TEVPF_COL_DEF text = col("a_rather_long_name", kText, 4);
    TEVPF_COL_DEF y = col("y", kDouble, 1, {-1e300, 1e300, 50});
    std::strcpy(text.units, "m/s");
    std::strcpy(y.units, "%");
    const std::string wide(55, 'a');
    const TEVPF_COL_DEF x = described(col("x", kReal, 8, {-1e6, 1e6, 3}), wide.c_str());
    define({indexed(described(col("id", kInt, 5, {-9999, 9999}), "identifier"), true), text,
            indexed(x), y, col("s", PF_TYPE_SHORT, 3, {-32768, 32767}), col("t", kText, 6)});
    add_rows({{"30", "ab\n", "1.5", "0.25", "7", "end "},
              {"10", "", "-0.0001", "0.1", "-32768", ""},
              {"20", "x\\y", "123456", "2.0", "5", "%d"}});
  }

  static std::string dump_table() {
    EXPECT_EQ(TEV8R1_PF_dump_table("t", "out.txt"), PF_NORMAL);
    return read_file("out.txt");
  }
  std::string listing(const std::vector<std::string>& names, std::int32_t first = 0,
                      std::int32_t last = PF_END_POS, std::int32_t definitions = 0) {
    std::vector<std::array<char, TEVPF_NAME_SIZE>> fields(names.size());
    for (std::size_t n = 0; n < names.size(); ++n) names[n].copy(fields[n].data(), 19);
    status_ = TEV8R1_PF_print_table(
        "t", "out.txt", definitions, static_cast<std::int32_t>(names.size()),
        reinterpret_cast<const char(*)[TEVPF_NAME_SIZE]>(fields.data()), first, last);
    return read_file("out.txt");
  }
  // What stands behind the heading of the rows' block.
  static std::string data_of(const std::string& report) {
    const std::string heading = "TABLE DATA\n\n";
    return report.substr(report.find(heading) + heading.size());
  }

  TEVPF_STATUS status_ = PF_NORMAL;  // of the last listing
};

}  // namespace tevpf
