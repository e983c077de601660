#include "tests/reports/report_fixture.h"

namespace tevpf {
namespace {

std::string blanks(std::size_t n) { return std::string(n, ' '); }
std::string dashes(std::size_t n) { return std::string(n, '-'); }

class Segments : public ReportTest {
 protected:
  static void columns(std::initializer_list<std::int32_t> widths) {
    table("T", "");
    char name[] = "a";
    for (const std::int32_t width : widths) {
      text_column(name, width);
      ++name[0];
    }
  }
};

TEST_F(Segments, ADumpIsOneLineUpTo130Characters) {
  columns({60, 67});
  row({"x", "y"});
  EXPECT_EQ(data_of(dump_table()), "." + blanks(29) + "a" + blanks(65) + "b\n." + dashes(129) +
                                       "\n\n x" + blanks(61) + "y\n");
}

// A width of 131: segments of 62 and 68 characters. A piece of a row ends neither in front of white
// space nor with a backslash, as long as it is shorter than 129 characters.
TEST_F(Segments, PiecesOfADumpTakeInBlanksAndBackslashes) {
  columns({60, 68});
  row({"x", "y"});
  row({"x", "  y"});
  row({"x", blanks(66) + "yy"});
  row({"x", blanks(67) + "y"});
  row({std::string(57, 'x') + "\n\n\n", "y"});
  const std::string x61 = "x" + blanks(61);
  EXPECT_EQ(data_of(dump_table()),
            "." + blanks(29) + "a" + blanks(32) + "\n." + dashes(61) + "\n.\t" + blanks(33) +
                "b\n." + dashes(67) + "\n\n " + x61 + "\\\n \ty\n " +  //
                x61 + "  \\\n \ty\n " +                                //
                x61 + blanks(66) + "\\\n \tyy\n " +                    //
                x61 + "\\\n \t" + blanks(67) + "y\n " +                //
                std::string(57, 'x') + "\\n\\n\\n  \\\n \ty\n");
}

// Limits fall from 129 by 8 to 113; a column that does not fit below stands alone, with at most 129
// dashes; tabs stop at two. The line ends before the segments do: nothing stands for what is missing.
TEST_F(Segments, WideColumnsStandAloneAndTabsStopAtTwo) {
  columns({127, 126, 140, 110, 111, 3});
  row({"1", "2", "3", "4", "5", ""});
  EXPECT_EQ(data_of(dump_table()),
            "." + blanks(63) + "a" + blanks(65) + "\n." + dashes(128) + "\n" +          //
                ".\t" + blanks(62) + "b" + blanks(65) + "\n." + dashes(127) + "\n" +    //
                ".\t\t" + blanks(69) + "c" + blanks(72) + "\n." + dashes(129) + "\n" +  //
                ".\t\t" + blanks(54) + "d" + blanks(57) + "\n." + dashes(111) + "\n" +  //
                ".\t\t" + blanks(55) + "e" + blanks(57) + "\n." + dashes(112) + "\n" +  //
                ".\t\t" + blanks(1) + "f\n." + dashes(2) + "\n\n" +                     //
                " 1" + blanks(128) + "\\\n \t2" + blanks(127) + "\\\n \t\t3" + blanks(141) +
                "\\\n \t\t4" + blanks(111) + "\\\n \t\t5" + blanks(112) + "\\\n \t\t\\0 \n");
}

// Columns go together while their widths, with the gaps, stay below 129, 121, 113, 113 in dumps and
// below 131, 123, 115, 115 in listings.
TEST_F(Segments, ColumnsShareASegmentBelowItsLimit) {
  const auto rules_of = [](const std::string& report) {
    std::string rules;
    std::istringstream lines(data_of(report));
    for (std::string line; std::getline(lines, line);) {
      if (line.starts_with(".-")) rules += std::to_string(line.size()) + " ";
    }
    return rules;
  };
  columns({60, 64, 60, 57, 51, 60, 48, 60, 49, 2});
  row(std::vector<Value>(10, "x"));
  EXPECT_EQ(rules_of(dump_table()), "128 62 112 112 62 53 ");
  text_column("k", 66);
  text_column("l", 59);
  text_column("m", 50);
  EXPECT_EQ(rules_of(listing({"a", "k", "a", "l", "e", "a", "m", "a", "e", "j"})),
            "130 62 114 114 62 55 ");
}

// Widths as they are declared, lines that are cut exactly, and other limits.
TEST_F(Segments, AListingIsOneLineUpTo132Characters) {
  columns({60, 68, 69});
  row({"x", "  y", "z"});
  EXPECT_EQ(data_of(listing({"a", "b"})), "." + blanks(29) + "a" + blanks(65) + "b\n." +
                                              dashes(131) + "\n\n x" + blanks(63) + "y" +
                                              blanks(65) + "\n");
  EXPECT_EQ(data_of(listing({"a", "c"})),
            "." + blanks(29) + "a" + blanks(32) + "\n." + dashes(61) + "\n.\t" + blanks(34) +
                "c\n." + dashes(68) + "\n\n x" + blanks(61) + "\\\n \tz" + blanks(68) + "\n");
  const std::string pieces =
      " x" + blanks(61) + "\\\n \t  y" + blanks(67) + "\\\n \t\t  y" + blanks(65) + "\n";
  EXPECT_TRUE(data_of(listing({"a", "b", "b"})).ends_with("\n\n" + pieces));
}

// The same columns by name are 133 wide; as "all columns" they are 132 and stay on one line.
TEST_F(Segments, AskingForMoreColumnsThanThereAreCountsOneLess) {
  columns({60, 69});
  row({"x", "y"});
  EXPECT_NE(data_of(listing({"a", "b"})).find("\\\n"), std::string::npos);
  EXPECT_EQ(data_of(listing({"a", "b", "c"})), "." + blanks(29) + "a" + blanks(66) + "b\n." +
                                                   dashes(131) + "\n\n x" + blanks(61) + "y" +
                                                   blanks(68) + "\n");
}

// A column of one wide enough for its own segment of a listing has a rule without bound.
TEST_F(Segments, RulesOfAListingHaveNoBound) {
  columns({200});
  row({"x"});
  EXPECT_EQ(data_of(listing({"a"})),
            "." + blanks(99) + "a\n." + dashes(199) + "\n\n x" + blanks(199) + "\n");
}

}  // namespace
}  // namespace tevpf
