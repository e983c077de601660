#include "core/number_text.h"

#include <gtest/gtest.h>

#include <bit>
#include <cmath>
#include <cstdio>
#include <random>
#include <string>

namespace tevpf {
namespace {

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

TEST(NumberText, GeneralGivesTheBytesOfPrintf) {
  std::mt19937_64 random(7);
  for (int round = 0; round < 300000; ++round) {
    const double number = any_number(random);
    const int precision = static_cast<int>(random() % 20) - 1;
    char ours[kMaxNumberText], expected[64];
    *write_general(ours, number, precision) = '\0';
    std::snprintf(expected, sizeof expected, "%.*g", precision, number);
    ASSERT_STREQ(ours, expected) << "precision " << precision << ", round " << round;
  }
}

}  // namespace
}  // namespace tevpf
