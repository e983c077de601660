#include <gtest/gtest.h>

#include <cfloat>
#include <climits>
#include <cstring>
#include <string>
#include <vector>

#include "include/tevpf.h"
#include "support/error_texts.h"
#include "values/value_type.h"

namespace {

constexpr TEVPF_STATUS kLess = static_cast<TEVPF_STATUS>(-1);
constexpr double kBefore = -7;  // what stands in the destination before a conversion

struct Conversion {
  std::int32_t type;
  std::string text;
  TEVPF_STATUS status;
  double value;        // on success
  std::string word{};  // on failure: err_value
};

// Converts at an odd address, as in a row, and gives back what stands there afterwards.
double convert(const Conversion& c, TEVPF_STATUS& status) {
  return tevpf::with_number(c.type, [&](auto tag) {
    using T = decltype(tag);
    char place[sizeof(T) + 1];
    tevpf::store(place + 1, static_cast<T>(kBefore));
    status = TEV8R1_from_char(c.type, c.text.c_str(), place + 1);
    return static_cast<double>(tevpf::load<T>(place + 1));
  });
}

TEST(Convert, TextToNumbers) {
  const std::string digits300(300, '9');
  const std::vector<Conversion> cases = {
      {PF_TYPE_INT, "2147483647", PF_NORMAL, 2147483647},
      {PF_TYPE_INT, "-2147483648", PF_NORMAL, -2147483648.0},
      {PF_TYPE_INT, "+2147483647", PF_NORMAL, 2147483647},
      {PF_TYPE_INT, "2147483648", PF_RANGE, 0},
      {PF_TYPE_INT, "+2147483648", PF_RANGE, 0},
      {PF_TYPE_INT, "-2147483649", PF_RANGE, 0},
      {PF_TYPE_INT, "00000000001", PF_RANGE, 0},
      {PF_TYPE_INT, "0000000001", PF_NORMAL, 1},
      {PF_TYPE_INT, "-0000000001", PF_NORMAL, -1},
      {PF_TYPE_INT, "-00000000001", PF_RANGE, 0},
      {PF_TYPE_INT, " -123456789", PF_RANGE, 0},
      {PF_TYPE_INT, " \t123", PF_NORMAL, 123},
      {PF_TYPE_INT, "", PF_NORMAL, 0},
      {PF_TYPE_INT, " ", PF_BADARG, 0, "integer"},
      {PF_TYPE_INT, "-", PF_BADARG, 0, "integer"},
      {PF_TYPE_INT, "12 ", PF_BADARG, 0, "integer"},
      {PF_TYPE_INT, "12a", PF_BADARG, 0, "integer"},
      {PF_TYPE_INT, "999999999999999999999x", PF_BADARG, 0, "integer"},
      {PF_TYPE_INT, digits300, PF_RANGE, 0},
      {PF_TYPE_SHORT, "32767", PF_NORMAL, 32767},
      {PF_TYPE_SHORT, "-32768", PF_NORMAL, -32768},
      {PF_TYPE_SHORT, "00000000000012", PF_NORMAL, 12},
      {PF_TYPE_SHORT, "32768", PF_RANGE, 0},
      {PF_TYPE_SHORT, "-99999999999999999999", PF_RANGE, 0},
      {PF_TYPE_SHORT, "1.5", PF_BADARG, 0, "short"},
      {PF_TYPE_SHORT, "", PF_NORMAL, 0},
      {PF_TYPE_DOUBLE, " \v2.5", PF_NORMAL, 2.5},
      {PF_TYPE_DOUBLE, "-.5e+1", PF_NORMAL, -5},
      {PF_TYPE_DOUBLE, "+5.", PF_NORMAL, 5},
      {PF_TYPE_DOUBLE, "0.1", PF_NORMAL, 0.1},
      {PF_TYPE_DOUBLE, "1.7976931348623157e308", PF_NORMAL, DBL_MAX},
      {PF_TYPE_DOUBLE, "2.2250738585072014e-308", PF_NORMAL, DBL_MIN},
      {PF_TYPE_DOUBLE, "2.2250738585072011e-308", PF_RANGE, 0},
      {PF_TYPE_DOUBLE, "0e-99999999999", PF_NORMAL, 0},
      {PF_TYPE_DOUBLE, "", PF_NORMAL, kBefore},
      {PF_TYPE_DOUBLE, "1e309", PF_RANGE, 0},
      {PF_TYPE_DOUBLE, "-1e309x", PF_RANGE, 0},
      {PF_TYPE_DOUBLE, "1e-400", PF_RANGE, 0},
      {PF_TYPE_DOUBLE, "-1e-310 ", PF_RANGE, 0},
      {PF_TYPE_DOUBLE, "1.5x", PF_BADARG, 0, "double"},
      {PF_TYPE_DOUBLE, "1.5 ", PF_BADARG, 0, "double"},
      {PF_TYPE_DOUBLE, "1e", PF_BADARG, 0, "double"},
      {PF_TYPE_DOUBLE, "+-1", PF_BADARG, 0, "double"},
      {PF_TYPE_DOUBLE, "- 1", PF_BADARG, 0, "double"},
      {PF_TYPE_DOUBLE, ".", PF_BADARG, 0, "double"},
      {PF_TYPE_DOUBLE, "   ", PF_BADARG, 0, "double"},
      {PF_TYPE_DOUBLE, "inf", PF_BADARG, 0, "double"},
      {PF_TYPE_DOUBLE, "-nan", PF_BADARG, 0, "double"},
      {PF_TYPE_DOUBLE, "0x1p3", PF_BADARG, 0, "double"},
      {PF_TYPE_DOUBLE, "1,5", PF_BADARG, 0, "double"},
      {PF_TYPE_REAL, "3.4028234663852886e38", PF_NORMAL, FLT_MAX},
      {PF_TYPE_REAL, "-3.4028234663852887e38", PF_NORMAL, -FLT_MAX},
      {PF_TYPE_REAL, "3.5e38", PF_RANGE, 0},
      {PF_TYPE_REAL, "1e309", PF_RANGE, 0},
      {PF_TYPE_REAL, "1e-50", PF_NORMAL, 0},
      {PF_TYPE_REAL, "0.1", PF_NORMAL, 0.1F},
      {PF_TYPE_REAL, "", PF_NORMAL, 0},
      {PF_TYPE_REAL, "abc", PF_BADARG, 0, "real"},
      {PF_TYPE_REAL, "-3.5e38x", PF_BADARG, 0, "real"},
      {PF_TYPE_DOUBLE, digits300 + digits300 + "x", PF_RANGE, 0},
  };
  for (const Conversion& c : cases) {
    SCOPED_TRACE("type " + std::to_string(c.type) + ", text '" + c.text + "'");
    set_error_texts();
    TEVPF_STATUS status;
    const double value = convert(c, status);
    EXPECT_EQ(status, c.status);
    if (c.status == PF_NORMAL) {
      EXPECT_EQ(value, c.value);
      EXPECT_EQ(error_texts(), kUntouched);
    } else {
      EXPECT_EQ(value, kBefore) << "a refused text leaves the destination as it was";
      EXPECT_EQ(error_texts(), (ErrorTexts{c.text.substr(0, 256), c.word}));
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
    const char *text, *pattern;
    TEVPF_STATUS order;
  } cases[] = {
      {"", "", PF_NORMAL},
      {"A", "", 1},
      {"", "A", kLess},
      {"AB", "ABC", kLess},
      {"ABC", "AB", 1},
      {"\x80", "z", 1},
      {"a", "\xff", kLess},
      {"ABCD", "AB*", PF_NORMAL},
      {"AB", "AB*", PF_NORMAL},
      {"A", "AB*", kLess},
      {"AC", "AB*", 1},
      {"", "*", PF_NORMAL},
      {"x", "*", PF_NORMAL},
      {"B1X", "B*X", 1},
      {"B*X", "B*X", PF_NORMAL},
      {"A*", "A**", kLess},
      {"A**", "A**", PF_NORMAL},
      {"A*B", "A*", PF_NORMAL},
      {"\xe9\x80", "\xe9*", PF_NORMAL},
  };
  for (const auto& c : cases) {
    EXPECT_EQ(TEV8R1_string_compare(c.text, c.pattern), c.order) << c.text << " : " << c.pattern;
  }
}

}  // namespace
