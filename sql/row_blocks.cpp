#include "row_blocks.h"

#include <algorithm>
#include <limits>

namespace sql {
namespace {

constexpr std::size_t kFirstBlock = 4;           // rows: few may be wanted
constexpr std::size_t kLargestBlock = 1U << 13;  // bytes: stays in the nearest cache

}  // namespace

const unsigned char* RowBlocks::read_block(std::size_t first, std::size_t count,
                                           std::size_t position) {
  count_ = 0;
  constexpr std::size_t kLimit = std::numeric_limits<std::int32_t>::max();
  if (table_.size() <= position || position > kLimit) return nullptr;  // makes the file current
  rows_.resize(std::max(rows_.size(), count * row_size_ + 1));
  if (!order_.empty()) numbers_.resize(std::max(numbers_.size(), count));
  auto copied = static_cast<std::int32_t>(count);
  const TEVPF_STATUS status = tevpf_get_rows(
      name_.c_str(), order_.empty() ? nullptr : order_.c_str(), static_cast<std::int32_t>(first),
      &copied, static_cast<std::int32_t>(row_size_), rows_.data(),
      order_.empty() ? nullptr : numbers_.data());
  if (status == PF_BADARG) {
    throw tevpf::Error(PF_TYPECHG, name_, {}, "the columns of table '" + name_ + "' have changed");
  }
  tevpf::detail::check(status);
  first_ = first;
  count_ = static_cast<std::size_t>(copied);
  return at_hand(position);
}

const unsigned char* RowBlocks::probe(std::size_t position) {
  return read_block(position, 1, position);
}

const unsigned char* RowBlocks::read(std::size_t position, bool backwards) {
  if (const unsigned char* const row = at_hand(position)) return row;
  const std::size_t largest =
      std::max<std::size_t>(kLargestBlock / std::max<std::size_t>(row_size_, 1), 1);
  wanted_ = std::min(std::max(wanted_ * 4, kFirstBlock), largest);
  const std::size_t in_front = backwards ? std::min(wanted_ - 1, position) : 0;
  return read_block(position - in_front, backwards ? in_front + 1 : wanted_, position);
}

}  // namespace sql
