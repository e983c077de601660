// Texts to values, values to texts, and the order of texts.
#include <gtest/gtest.h>

#include <bit>
#include <climits>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <random>
#include <string>
#include <utility>
#include <vector>

#include "core/base/number_text.h"
#include "support/error_texts.h"
#include "values/value_type.h"

namespace {

using Texts = std::vector<std::string>;

constexpr double kBefore = -7;  // what stands in the destination before a conversion

// Converts at an odd address, as in a row; afterwards there stands what the C library makes of `then`.
void expect_converted(std::int32_t type, const std::string& text, const std::string& then,
                      TEVPF_STATUS status, const ErrorTexts& texts) {
  const testing::ScopedTrace trace(__FILE__, __LINE__, std::to_string(type) + ' ' + text);
  tevpf::with_number(type, [&](auto tag) {
    using T = decltype(tag);
    char place[sizeof(T) + 1];
    tevpf::store(place + 1, static_cast<T>(kBefore));
    expect_answer(TEV8R1_from_char(type, text.c_str(), place + 1), status, texts);
    EXPECT_EQ(tevpf::load<T>(place + 1), static_cast<T>(std::strtod(then.c_str(), nullptr)));
  });
}

TEST(Convert, TextsToValues) {
  const std::string nines(300, '9'), before = std::to_string(kBefore);
  const struct {
    std::int32_t type;
    const char* name;
    const char* empty;  // what an empty text gives
    Texts values, out_of_range, malformed;
  } types[] = {
      {PF_TYPE_INT, "integer", "0",
       Texts{"2147483647", "-2147483648", "+2147483647", "0000000001", "-0000000001", " \t123"},
       Texts{"2147483648", "+2147483648", "-2147483649", "00000000001", "-00000000001",
             " -123456789", nines},
       Texts{" ", "-", "12 ", "12a", "999999999999999999999x"}},
      {PF_TYPE_SHORT, "short", "0", Texts{"32767", "-32768", "00000000000012"},
       Texts{"32768", "-32769", "-99999999999999999999"}, Texts{"1.5", "32768x"}},
      {PF_TYPE_DOUBLE, "double", before.c_str(),
       Texts{" \v2.5", "-.5e+1", "+5.", "0.1", "1.7976931348623157e308", "2.2250738585072014e-308",
             "0e-99999999999"},
       Texts{"1e309", "-1e309x", "1e-400", "-1e-310 ", "2.2250738585072011e-308",
             nines + nines + "x"},
       Texts{"1.5x", "1.5 ", "1e", "+-1", "- 1", ".", "   ", "inf", "-nan", "0x1p3", "1,5"}},
      {PF_TYPE_REAL, "real", "0",
       Texts{"3.4028234663852886e38", "-3.4028234663852887e38", "1e-50", "0.1"},
       Texts{"3.402823466385289e38", "-3.5e38", "1e309"}, Texts{"abc", "-3.5e38x", nines + "x"}},
  };
  set_error_texts();
  for (const auto& t : types) {
    expect_converted(t.type, "", t.empty, PF_NORMAL, kUntouched);
    for (const auto& text : t.values) expect_converted(t.type, text, text, PF_NORMAL, kUntouched);
    for (const std::string& text : t.out_of_range) {
      expect_converted(t.type, text, before, PF_RANGE, {text.substr(0, 256), ""});
    }
    for (const std::string& text : t.malformed) {
      expect_converted(t.type, text, before, PF_BADARG, {text.substr(0, 256), t.name});
    }
  }
}

TEST(Convert, ValuesToText) {
  const std::int32_t i = INT_MIN;
  const std::int16_t s = -1;
  const float f = 1 / 3.0F;
  const double d = 1e-5;
  const struct {
    std::int32_t type;
    const char* format;
    const void* value;
    const char* text;
  } cases[] = {
      {PF_TYPE_INT, nullptr, &i, "-2147483648"}, {PF_TYPE_INT, "%13d|", &i, "  -2147483648|"},
      {PF_TYPE_SHORT, nullptr, &s, "-1"},        {PF_TYPE_SHORT, "%04d", &s, "-001"},
      {PF_TYPE_REAL, nullptr, &f, "0.333333"},   {PF_TYPE_REAL, "%.9g", &f, "0.333333343"},
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
  std::int32_t size = -1;
  const std::int32_t sizes[] = {4, 4, 4, 8, 2};  // by type; of a string of 3 characters
  for (std::int32_t i = 0; i < 5; ++i) {
    EXPECT_EQ(TEV8R1_compute_size(PF_TYPE_INT + i, 3, &size), PF_NORMAL);
    EXPECT_EQ(size, sizes[i]);
  }
  for (const std::int32_t type : {10, 16, 0, INT_MIN}) {
    char text[4] = "xyz";
    size = -1;
    const ErrorTexts texts{"value", std::to_string(type)};
    expect_answer(TEV8R1_compute_size(type, 3, &size), PF_BADTYPE, texts);
    expect_answer(TEV8R1_from_char(type, "1", text), PF_BADTYPE, texts);
    expect_answer(TEV8R1_to_char(type, nullptr, "1", text, &size), PF_BADTYPE, texts);
    EXPECT_EQ(size, -1);
    EXPECT_STREQ(text, "xyz");
  }
}

// Numbers of all sizes, ties between two roundings, and neighbours of powers of ten.
double any_number(std::mt19937_64& random) {
  const auto whole = static_cast<double>(random() % 2000000);
  const double power = std::pow(10, static_cast<int>(random() % 60) - 30);
  const double numbers[] = {
      std::bit_cast<double>(random()),
      std::ldexp(whole + 0.5, static_cast<int>(random() % 60) - 30),
      -whole * power,
      std::nextafter(power, random() % 2 == 0 ? 0 : 1e300),
      static_cast<float>(whole / 1000),
      std::ldexp(static_cast<double>(random() >> 11), static_cast<int>(random() % 220) - 163)};
  return numbers[random() % std::size(numbers)];
}

TEST(Convert, NumbersGetTheBytesOfPrintf) {
  std::mt19937_64 random(7);
  for (int round = 0; round < 300000; ++round) {
    const double number = any_number(random);
    const int precision = static_cast<int>(random() % 20) - 1;
    char ours[tevpf::kMaxNumberText], expected[64];
    *tevpf::write_general(ours, number, precision) = '\0';
    // Not every C runtime shows the sign of what is no number.
    if (std::isnan(number)) {
      std::strcpy(expected, std::signbit(number) ? "-nan" : "nan");
    } else {
      std::snprintf(expected, sizeof expected, "%.*g", precision, number);
    }
    ASSERT_STREQ(ours, expected) << "precision " << precision << ", round " << round;
  }
}

TEST(TextCompare, BytesAndPrefixes) {
  const struct {
    int order;
    std::vector<std::pair<const char*, const char*>> pairs;
  } cases[] = {{-1, {{"", "A"}, {"AB", "ABC"}, {"a", "\xff"}, {"A", "AB*"}, {"A*", "A**"}}},
               {PF_NORMAL, {{"", ""}, {"ABCD", "AB*"}, {"AB", "AB*"}, {"", "*"}, {"x", "*"}}},
               {PF_NORMAL, {{"B*X", "B*X"}, {"A**", "A**"}, {"A*B", "A*"}, {"\xe9\x80", "\xe9*"}}},
               {1, {{"A", ""}, {"ABC", "AB"}, {"\x80", "z"}, {"AC", "AB*"}, {"B1X", "B*X"}}}};
  for (const auto& c : cases) {
    for (const auto& [text, pattern] : c.pairs) {
      EXPECT_EQ(TEV8R1_string_compare(text, pattern), static_cast<TEVPF_STATUS>(c.order))
          << text << " : " << pattern;
    }
  }
}

}  // namespace
