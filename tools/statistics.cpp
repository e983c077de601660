#include "statistics.h"

#include <algorithm>
#include <cmath>

namespace tool {
namespace {

constexpr std::size_t kMostBins = 20;

std::size_t bins_for(double low, double high, bool are_integers) {
  if (low >= high) return 1;
  const double values = high - low + 1;  // of integers; this may be infinite
  return are_integers && values <= kMostBins ? static_cast<std::size_t>(values) : kMostBins;
}

}  // namespace

void Summary::add(double number) {
  if (std::isnan(number)) {
    ++missing_;
    return;
  }
  ++count_;
  smallest_ = std::min(smallest_, number);
  largest_ = std::max(largest_, number);
  // Neumaier's sum: the digits that the smaller summand loses are kept aside.
  const double sum = sum_ + number;
  lost_ += std::abs(sum_) >= std::abs(number) ? (sum_ - sum) + number : (number - sum) + sum_;
  sum_ = sum;
  if (!std::isfinite(number)) return;
  low_ = std::min(low_, number);
  high_ = std::max(high_, number);
}

double Summary::mean() const { return (sum_ + lost_) / static_cast<double>(count_); }

Histogram::Histogram(double low, double high, bool are_integers)
    : low_(low), high_(high), counts_(bins_for(low, high, are_integers)) {}

void Histogram::add(double number) {
  if (!(number >= low_ && number <= high_)) return;
  // Halves, because the range may be wider than the largest double. That of the smallest ones is 0.
  const double range = high_ / 2 - low_ / 2;
  const double part = range > 0 ? (number / 2 - low_ / 2) / range : 0;
  const auto bin = static_cast<std::size_t>(part * static_cast<double>(counts_.size()));
  ++counts_[std::min(bin, counts_.size() - 1)];
}

}  // namespace tool
