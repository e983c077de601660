#include <gtest/gtest.h>

#include <cfloat>
#include <climits>
#include <cstring>
#include <string>
#include <utility>
#include <vector>

#include "include/tevpf.h"
#include "support/error_texts.h"
#include "values/value_type.h"

namespace {

constexpr TEVPF_STATUS kLess = static_cast<TEVPF_STATUS>(-1);
constexpr double kBefore = -7;  // what stands in the destination before a conversion

// Converts at an odd address, as in a row, and gives back what stands there afterwards.
double convert(std::int32_t type, const std::string& text, TEVPF_STATUS& status) {
  return tevpf::with_number(type, [&](auto tag) {
    using T = decltype(tag);
    char place[sizeof(T) + 1];
    tevpf::store(place + 1, static_cast<T>(kBefore));
    status = TEV8R1_from_char(type, text.c_str(), place + 1);
    return static_cast<double>(tevpf::load<T>(place + 1));
  });
}

TEST(Convert, TextsToValues) {
  const std::string nines(300, '9');
  const struct {
    std::int32_t type;
    const char* type_name;
    std::vector<std::pair<const char*, double>> numbers;
    std::vector<std::string> out_of_range, malformed;
  } types[] = {
      {PF_TYPE_INT,
       "integer",
       {{"2147483647", INT_MAX},
        {"-2147483648", INT_MIN},
        {"+2147483647", INT_MAX},
        {"0000000001", 1},
        {"-0000000001", -1},
        {" \t123", 123},
        {"", 0}},
       {"2147483648", "+2147483648", "-2147483649", "00000000001", "-00000000001", " -123456789",
        nines},
       {" ", "-", "12 ", "12a", "999999999999999999999x"}},
      {PF_TYPE_SHORT,
       "short",
       {{"32767", 32767}, {"-32768", -32768}, {"00000000000012", 12}, {"", 0}},
       {"32768", "-32769", "-99999999999999999999"},
       {"1.5", "32768x"}},
      {PF_TYPE_DOUBLE,
       "double",
       {{" \v2.5", 2.5},
        {"-.5e+1", -5},
        {"+5.", 5},
        {"0.1", 0.1},
        {"1.7976931348623157e308", DBL_MAX},
        {"2.2250738585072014e-308", DBL_MIN},
        {"0e-99999999999", 0},
        {"", kBefore}},
       {"1e309", "-1e309x", "1e-400", "-1e-310 ", "2.2250738585072011e-308", nines + nines + "x"},
       {"1.5x", "1.5 ", "1e", "+-1", "- 1", ".", "   ", "inf", "-nan", "0x1p3", "1,5"}},
      {PF_TYPE_REAL,
       "real",
       {{"3.4028234663852886e38", FLT_MAX},
        {"-3.4028234663852887e38", -FLT_MAX},
        {"1e-50", 0},
        {"0.1", 0.1F},
        {"", 0}},
       {"3.5e38", "-3.5e38", "1e309"},
       {"abc", "-3.5e38x", nines + "x"}},
  };
  for (const auto& t : types) {
    const auto expect = [&](const std::string& text, double value, TEVPF_STATUS expected,
                            const ErrorTexts& texts) {
      set_error_texts();
      TEVPF_STATUS status;
      EXPECT_EQ(convert(t.type, text, status), value) << t.type_name << ' ' << text;
      EXPECT_EQ(status, expected) << t.type_name << ' ' << text;
      EXPECT_EQ(error_texts(), texts);
    };
    for (const auto& [text, value] : t.numbers) expect(text, value, PF_NORMAL, kUntouched);
    for (const std::string& text : t.out_of_range) {
      expect(text, kBefore, PF_RANGE, {text.substr(0, 256), ""});
    }
    for (const std::string& text : t.malformed) {
      expect(text, kBefore, PF_BADARG, {text.substr(0, 256), t.type_name});
    }
  }
}

TEST(Convert, ValuesToText) {
  const std::int32_t i = INT_MIN;
  const std::int16_t s = -1;
  const float f = 0.1F;
  const double d = 1e-5;
  const struct {
    std::int32_t type;
    const char* format;
    const void* value;
    const char* text;
  } cases[] = {
      {PF_TYPE_INT, nullptr, &i, "-2147483648"}, {PF_TYPE_INT, "%13d|", &i, "  -2147483648|"},
      {PF_TYPE_SHORT, nullptr, &s, "-1"},        {PF_TYPE_SHORT, "%04d", &s, "-001"},
      {PF_TYPE_REAL, nullptr, &f, "0.1"},        {PF_TYPE_REAL, "%.9g", &f, "0.100000001"},
      {PF_TYPE_DOUBLE, nullptr, &d, "1e-05"},    {PF_TYPE_DOUBLE, "%-8.1f|", &d, "0.0     |"},
      {PF_TYPE_STRING, nullptr, "", ""},         {PF_TYPE_STRING, "%.2s", "abc", "ab"},
      {PF_TYPE_STRING, nullptr, "abc", "abc"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.text);
    char text[64] = "before";
    std::int32_t length = -1;
    EXPECT_EQ(TEV8R1_to_char(c.type, c.format, c.value, text, &length), PF_NORMAL);
    EXPECT_STREQ(text, c.text);
    EXPECT_EQ(length, static_cast<std::int32_t>(std::strlen(c.text)));
  }
  char copy[4] = "xyz";
  EXPECT_EQ(TEV8R1_from_char(PF_TYPE_STRING, "ab", copy), PF_NORMAL);
  EXPECT_STREQ(copy, "ab");
}

TEST(Convert, SizesAndWrongTypes) {
  const std::int32_t sizes[] = {4, 4, 1, 8, 2};
  std::int32_t size = -1;
  for (std::int32_t type = PF_TYPE_INT; type <= PF_TYPE_SHORT; ++type) {
    EXPECT_EQ(TEV8R1_compute_size(type, 0, &size), PF_NORMAL);
    EXPECT_EQ(size, sizes[type - PF_TYPE_INT]);
  }
  for (const std::int32_t type : {10, 16, 0, INT_MIN}) {
    char text[4] = "xyz";
    size = -1;
    for (const int operation : {0, 1, 2}) {
      set_error_texts();
      EXPECT_EQ(operation == 0   ? TEV8R1_compute_size(type, 3, &size)
                : operation == 1 ? TEV8R1_from_char(type, "1", text)
                                 : TEV8R1_to_char(type, nullptr, "1", text, &size),
                PF_BADTYPE);
      EXPECT_EQ(error_texts(), (ErrorTexts{"value", std::to_string(type)}));
    }
    EXPECT_EQ(size, -1);
    EXPECT_STREQ(text, "xyz");
  }
}

TEST(TextCompare, BytesAndPrefixes) {
  const struct {
    TEVPF_STATUS order;
    std::vector<std::pair<const char*, const char*>> pairs;
  } cases[] = {{kLess, {{"", "A"}, {"AB", "ABC"}, {"a", "\xff"}, {"A", "AB*"}, {"A*", "A**"}}},
               {PF_NORMAL, {{"", ""}, {"ABCD", "AB*"}, {"AB", "AB*"}, {"", "*"}, {"x", "*"}}},
               {PF_NORMAL, {{"B*X", "B*X"}, {"A**", "A**"}, {"A*B", "A*"}, {"\xe9\x80", "\xe9*"}}},
               {1, {{"A", ""}, {"ABC", "AB"}, {"\x80", "z"}, {"AC", "AB*"}, {"B1X", "B*X"}}}};
  for (const auto& c : cases) {
    for (const auto& [text, pattern] : c.pairs) {
      EXPECT_EQ(TEV8R1_string_compare(text, pattern), c.order) << text << " : " << pattern;
    }
  }
}

}  // namespace
