// What the numbers of a column are like as a whole. They are added one by one and not kept.
#pragma once

#include <cstddef>
#include <limits>
#include <vector>

namespace tool {

class Summary {
 public:
  void add(double number);  // what is not a number counts as missing

  std::size_t count() const { return count_; }
  std::size_t missing() const { return missing_; }

  // Without numbers these mean nothing. Infinite ones take part.
  double smallest() const { return smallest_; }
  double largest() const { return largest_; }
  double mean() const;  // not finite when a number or the sum is not

  // The range of the finite numbers; empty, with low above high, when there are none.
  double low() const { return low_; }
  double high() const { return high_; }

 private:
  static constexpr double kInfinity = std::numeric_limits<double>::infinity();

  std::size_t count_ = 0, missing_ = 0;
  double smallest_ = kInfinity, largest_ = -kInfinity;
  double low_ = kInfinity, high_ = -kInfinity;
  double sum_ = 0, lost_ = 0;  // lost: what rounding took from the sum
};

// How many numbers lie in each of a row of bins of equal width.
class Histogram {
 public:
  // For numbers from low to high, both finite. Of a few integers each gets its own bin.
  Histogram(double low, double high, bool are_integers);

  void add(double number);  // one from low to high; others are left out

  const std::vector<std::size_t>& counts() const { return counts_; }

 private:
  double low_, high_;
  std::vector<std::size_t> counts_;
};

}  // namespace tool
