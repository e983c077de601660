// Rows of a table by their position in an order, read ahead in either direction.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "tevpf.hpp"

namespace sql {

class RowBlocks {
 public:
  // order: an indexed column; empty for storage order.
  RowBlocks(tevpf::Table table, std::size_t row_size, std::string order)
      : table_(std::move(table)),
        name_(table_.name()),
        order_(std::move(order)),
        row_size_(row_size) {}

  // The row at a position, when it has been read; else null. Rows stay until the next read.
  const unsigned char* at_hand(std::size_t position) const noexcept {
    const std::size_t index = position - first_;
    return index < count_ ? rows_.data() + index * row_size_ : nullptr;
  }

  // The row at a position, null behind the last one; reads the rows that follow, or (backwards) lie in
  // front of it, with it. Throws tevpf::Error when the columns have changed.
  const unsigned char* read(std::size_t position, bool backwards = false);
  // The row alone.
  const unsigned char* probe(std::size_t position);

  // The number, in storage order, of a row at hand.
  std::size_t number(std::size_t position) const noexcept {
    return order_.empty() ? position : static_cast<std::size_t>(numbers_[position - first_]);
  }

  void forget() noexcept { count_ = 0; }  // rows have changed

 private:
  const unsigned char* read_block(std::size_t first, std::size_t count, std::size_t position);

  tevpf::Table table_;
  std::string name_, order_;
  std::size_t row_size_;
  std::vector<unsigned char> rows_;
  std::vector<std::int32_t> numbers_;
  std::size_t first_ = 0, count_ = 0;
  std::size_t wanted_ = 0;  // rows of the block read last
};

}  // namespace sql
