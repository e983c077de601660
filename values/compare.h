// The order and equality of values: every index, range check, uniqueness check and search compares
// through this file.
//
// A search prepares its key once (with_key) and then compares stored values with it, without a type
// check per comparison. The stored value is always the left operand, so only a key can be a
// pattern.
#pragma once

#include <cstddef>
#include <cstdint>

#include "core/base/text_word.h"
#include "values/text_compare.h"
#include "values/value_type.h"

namespace tevpf {

// Compares a with b: negative, 0 or positive. Reals and doubles within the tolerance are equal, and
// NaN is equal to everything.
template <class T>
int compare_numbers(T a, T b, [[maybe_unused]] double tolerance) noexcept {
  if constexpr (kIsFloating<T>) {
    const double x = a, y = b;
    return int{(y < x) & (x - tolerance > y)} - int{(y > x) & (x + tolerance < y)};
  } else {
    return int{a > b} - int{a < b};  // cppcheck-suppress missingReturn; either branch returns
  }
}

// A number to search for.
template <class T>
class NumberKey {
 public:
  using Number = T;
  static constexpr bool kIsNumber = true;
  static constexpr bool kTotalOrder = !kIsFloating<T>;  // equality is transitive

  NumberKey(const void* key, double tolerance) noexcept
      : key_(load<T>(key)), tolerance_(tolerance) {}

  // Compares the value stored at `place` with the key: negative, 0 or positive.
  int compare(T value) const noexcept { return compare_numbers(value, key_, tolerance_); }
  int compare(const unsigned char* place) const noexcept { return compare(load<T>(place)); }
  bool is_above(T value) const noexcept { return value < key_; }
  bool is_above(const unsigned char* place) const noexcept { return is_above(load<T>(place)); }
  // compare() == 0 in fewer steps.
  bool equals(const unsigned char* place) const noexcept { return equals(load<T>(place)); }
  bool equals(T value) const noexcept {
    if constexpr (kIsFloating<T>) {
      if (!(tolerance_ >= 0)) return compare(value) == 0;
      const double x = value, y = key_;
      return !((x - tolerance_ > y) | (x + tolerance_ < y));
    } else {
      return value == key_;
    }
  }

  // False if none of kCount values equals the key; kCount is a multiple of 4, and value i is stored
  // at place(i). Whether a real lies below or above the key is unpredictable for the branch
  // predictor, so there is no branch per value.
  template <std::int32_t kCount, class Place>
  bool may_equal_one_of(const Place& place) const noexcept {
    if constexpr (kIsFloating<T>) {
      return !(tolerance_ >= 0) || is_near_one_of<kCount>(place);
    } else {
      using Flag = std::make_unsigned_t<T>;  // as wide as a value, so that compilers vectorise
      Flag found = 0;
      for (std::int32_t i = 0; i < kCount; ++i) {
        found = static_cast<Flag>(found | Flag{equals(place(i))});
      }
      return found != 0;
    }
  }

 private:
  // Counts in doubles, which every processor compares and selects two at a time, with two
  // alternating sums, so that an addition does not wait for the previous one.
  template <std::int32_t kCount, class Place>
  bool is_near_one_of(const Place& place) const noexcept {
    using Pair [[gnu::vector_size(2 * sizeof(double))]] = double;
    constexpr Pair kNone = {0, 0}, kOne = {1, 1};
    const auto near = [&](std::int32_t i) {
      const Pair x = {load<T>(place(i)), load<T>(place(i + 1))};
      const auto differs = (x - tolerance_ > double{key_}) | (x + tolerance_ < double{key_});
      return differs ? kNone : kOne;
    };
    Pair even = kNone, odd = kNone;
    for (std::int32_t i = 0; i < kCount; i += 4) {
      even += near(i);
      odd += near(i + 2);
    }
    const Pair sum = even + odd;
    return sum[0] + sum[1] != 0;
  }

  T key_;
  double tolerance_;  // unused for integers
};

inline constexpr std::size_t kHeadSize = 8;

// The first eight bytes of a text as a number with the same order; bytes after the terminator are
// zero. All eight bytes must be readable.
inline std::uint64_t wide_text_head(const unsigned char* text) noexcept {
  const std::uint64_t bytes = load_word(text);
  const std::uint64_t ends = zero_bytes(bytes);
  return __builtin_bswap64(bytes & (ends ^ (ends - 1)));  // up to the first zero byte, or all eight
}

// The same, but reads nothing past the terminator.
inline std::uint64_t text_head(const unsigned char* text) noexcept {
  std::uint64_t head = 0;
  for (std::size_t i = 0; i < kHeadSize && text[i] != 0; ++i) {
    head |= std::uint64_t{text[i]} << (56 - 8 * i);
  }
  return head;
}

// Whether a head holds its whole text, so that equal heads are equal texts.
constexpr bool holds_whole_text(std::uint64_t head) noexcept { return (head & 0xFF) == 0; }

// A text or pattern to search for. kWide: at least eight bytes are readable from the start of every
// value.
template <bool kWide>
class TextKey {
 public:
  static constexpr bool kIsNumber = false;
  static constexpr bool kTotalOrder = true;

  explicit TextKey(const void* key) noexcept
      : pattern_(make_pattern(static_cast<const char*>(key))) {
    // For a prefix, only its own bytes are compared; for a text, the terminator too.
    const std::size_t compared = pattern_.length + (pattern_.prefix ? 0 : 1);
    if (compared < kHeadSize) head_mask_ = ~(~std::uint64_t{0} >> (8 * compared));
    head_ = text_head(static_cast<const unsigned char*>(key)) & head_mask_;
    has_rest_ = compared > kHeadSize;
    if (!has_rest_) return;
    pattern_.text += kHeadSize;
    pattern_.length -= kHeadSize;
  }

  int compare(const unsigned char* place) const noexcept {
    const std::uint64_t head = (kWide ? wide_text_head(place) : text_head(place)) & head_mask_;
    if (head != head_) return head < head_ ? -1 : 1;
    if (!has_rest_) return 0;
    return compare_rest(place);
  }
  bool is_above(const unsigned char* place) const noexcept { return compare(place) < 0; }
  // compare() == 0. Without the order, bytes after a terminator need not be masked off.
  bool equals(const unsigned char* place) const noexcept {
    if constexpr (kWide) {
      if (((__builtin_bswap64(load<std::uint64_t>(place)) ^ head_) & head_mask_) != 0) return false;
      return !has_rest_ || compare_rest(place) == 0;
    } else {
      return compare(place) == 0;
    }
  }

 private:
  int compare_rest(const unsigned char* place) const noexcept {
    return compare_text(reinterpret_cast<const char*>(place) + kHeadSize, pattern_);
  }

  TextPattern pattern_;  // what follows the head
  bool has_rest_;        // false: the head decides alone
  std::uint64_t head_;
  std::uint64_t head_mask_ = ~std::uint64_t{0};
};

// Skips blocks of kCount values from `first` on while no value of a block can equal the key.
template <std::int32_t kCount, class T, class Place>
std::int32_t skip_blocks(std::int32_t first, std::int32_t count, const NumberKey<T>& key,
                         const Place& place) noexcept {
  std::int32_t at = first;
  const auto in_block = [&](std::int32_t i) { return place(at + i); };
  while (count - at >= kCount && !key.template may_equal_one_of<kCount>(in_block)) at += kCount;
  return at;
}

// The first position from `first` on whose value equals the key, or `count` if none does; place(at)
// is the address of the value at a position. Numbers are compared in long blocks first, then in
// short ones.
template <class Key, class Place>
std::int32_t find_first(std::int32_t first, std::int32_t count, const Key& key,
                        const Place& place) noexcept {
#ifdef TEVPF_TEST_HOOKS
  constexpr std::int32_t kLong = 8;  // even small tables have blocks
#else
  constexpr std::int32_t kLong = 64;
#endif
  std::int32_t at = first;
  if constexpr (Key::kIsNumber) {
    at = skip_blocks<kLong>(at, count, key, place);
    at = skip_blocks<4>(at, count, key, place);
  }
  while (at < count && !key.equals(place(at))) ++at;
  return at;
}

// The same for contiguous values.
template <class T>
std::int32_t find_in_line(const void* values, std::int32_t count, std::int32_t first,
                          const NumberKey<T>& key) noexcept {
  return find_first(first, count, key, [&](std::int32_t at) {
    return static_cast<const unsigned char*>(values) + at * std::ptrdiff_t{sizeof(T)};
  });
}

// Calls f with the prepared key of a valid type. `readable` is the number of bytes readable from
// the start of every stored value, or 0 if unknown.
template <class F>
decltype(auto) with_key(std::int32_t type, double tolerance, const void* key, std::int64_t readable,
                        F&& f) {
  if (type == PF_TYPE_STRING) {
    if (readable >= std::int64_t{kHeadSize}) return f(TextKey<true>(key));
    return f(TextKey<false>(key));
  }
  return with_number(type, [&](auto tag) { return f(NumberKey<decltype(tag)>(key, tolerance)); });
}

}  // namespace tevpf
