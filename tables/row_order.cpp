#include "tables/row_order.h"

#include <algorithm>
#include <cmath>
#include <cstring>

#include "core/base/heap.h"
#include "tables/row_store.h"
#include "values/compare.h"

namespace tevpf {
namespace {

// Maps numbers to unsigned keys in the same order; 0.0 and -0.0 are one value, and NaN comes last.
std::uint32_t sort_key(std::int32_t value) noexcept {
  return static_cast<std::uint32_t>(value) ^ 0x80000000u;
}
std::uint32_t sort_key(std::int16_t value) noexcept { return sort_key(std::int32_t{value}); }
template <class T>
T value_of_sort_key(std::uint32_t key) noexcept {
  return static_cast<T>(static_cast<std::int32_t>(key ^ 0x80000000u));
}

template <class Bits, class T>
Bits floating_sort_key(T value) noexcept {
  if (std::isnan(value)) return ~Bits{0};
  value += T{0};
  const Bits bits = load<Bits>(&value);
  constexpr Bits sign = Bits{1} << (8 * sizeof(Bits) - 1);
  return (bits & sign) != 0 ? ~bits : bits | sign;
}
std::uint32_t sort_key(float value) noexcept { return floating_sort_key<std::uint32_t>(value); }
std::uint64_t sort_key(double value) noexcept { return floating_sort_key<std::uint64_t>(value); }

struct KeyedRow {
  std::uint64_t key;
  std::int32_t row;
};

template <class Entry, class Less>
void sort_entries(Entry* entries, std::int32_t count, Less less) noexcept {
  if (!std::is_sorted(entries, entries + count, less)) std::sort(entries, entries + count, less);
}

// A 32-bit key and its row number form one 64-bit number.
template <class T>
bool sort_rows_by_short_key(const Values& values, std::int32_t count, std::int32_t* out,
                            unsigned char* sorted) noexcept {
  const auto keys = new_array<std::uint64_t>(static_cast<std::uint64_t>(count));
  if (!keys) return false;
  for (std::int32_t row = 0; row < count; ++row) {
    const std::uint64_t key = sort_key(load<T>(values.of(row)));
    keys[row] = key << 32 | static_cast<std::uint32_t>(row);
  }
  sort_entries(keys.get(), count, [](std::uint64_t a, std::uint64_t b) { return a < b; });
  for (std::int32_t i = 0; i < count; ++i) out[i] = static_cast<std::int32_t>(keys[i]);
  if constexpr (!kIsFloating<T>) {
    auto* const values_out = reinterpret_cast<T*>(sorted);
    for (std::int32_t i = 0; values_out != nullptr && i < count; ++i) {
      values_out[i] = value_of_sort_key<T>(static_cast<std::uint32_t>(keys[i] >> 32));
    }
  }
  return true;
}

// 64-bit keys; `rest` compares two rows with equal keys (below 0, 0, above 0).
template <class KeyOf, class Rest>
bool sort_rows_by_long_key(std::int32_t count, std::int32_t* out, KeyOf key_of,
                           Rest rest) noexcept {
  const auto keys = new_array<KeyedRow>(static_cast<std::uint64_t>(count));
  if (!keys) return false;
  for (std::int32_t row = 0; row < count; ++row) keys[row] = {key_of(row), row};
  sort_entries(keys.get(), count, [&](const KeyedRow& a, const KeyedRow& b) {
    if (a.key != b.key) return a.key < b.key;
    const int order = rest(a, b);
    return order != 0 ? order < 0 : a.row < b.row;
  });
  for (std::int32_t i = 0; i < count; ++i) out[i] = keys[i].row;
  return true;
}

bool sort_rows_by_text(const Values& values, std::int64_t readable, std::int32_t count,
                       std::int32_t* out) noexcept {
  const bool wide = readable >= std::int64_t{kHeadSize};
  const auto head = [&](std::int32_t row) {
    return wide ? wide_text_head(values.of(row)) : text_head(values.of(row));
  };
  const auto rest = [&](const KeyedRow& a, const KeyedRow& b) {
    if (holds_whole_text(a.key)) return 0;
    return std::strcmp(reinterpret_cast<const char*>(values.of(a.row)) + kHeadSize,
                       reinterpret_cast<const char*>(values.of(b.row)) + kHeadSize);
  };
  return sort_rows_by_long_key(count, out, head, rest);
}

}  // namespace

bool sort_rows(const TEVPF_TABLE& table, const TEVPF_COLUMN& column, std::int32_t* out,
               [[maybe_unused]] unsigned char* sorted) noexcept {
  const Values values = values_of(table, column);
  const std::int32_t count = table.num_rows;
  if (column.def.type == PF_TYPE_STRING) {
    return sort_rows_by_text(values, readable_bytes(table, column), count, out);
  }
  return with_number(column.def.type, [&](auto tag) {
    using T = decltype(tag);
    if constexpr (sizeof(T) <= 4) {
      return sort_rows_by_short_key<T>(values, count, out, sorted);
    } else {
      return sort_rows_by_long_key(
          count, out, [&](std::int32_t row) { return sort_key(load<T>(values.of(row))); },
          [](const KeyedRow&, const KeyedRow&) { return 0; });
    }
  });
}

}  // namespace tevpf
