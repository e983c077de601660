#include "tables/index_search.h"

#include <algorithm>
#include <cstddef>

#include "core/sequence/sequence_search.h"
#include "tables/row_store.h"
#include "tables/search_keys.h"
#include "values/compare.h"

namespace tevpf {
namespace {

// ---- Places -------------------------------------------------------------------------------------

// The values that a search probes, by position: those of a contiguous array of entries, or of a
// column's index.
struct ValuesOfEntries {
  Values values;
  const std::int32_t* entries;

  const unsigned char* at(std::int32_t position) const noexcept {
    return values.of(entries[position]);
  }
};

template <class T>
struct ValuesInLine {
  const unsigned char* first;

  const unsigned char* at(std::int32_t position) const noexcept {
    return first + position * std::ptrdiff_t{sizeof(T)};
  }
  ValuesInLine from(std::int32_t position) const noexcept { return {at(position)}; }
};

struct ValuesOfIndex {
  Values values;
  const Sequence& index;

  const unsigned char* at(std::int32_t position) const noexcept {
    return values.of(index.at(position));
  }
};

ValuesOfIndex entries_of(const TEVPF_TABLE& table, const TEVPF_COLUMN& column) noexcept {
  return {values_of(table, column), column.index};
}

template <class At>
struct ValuesFrom {
  At at;
};

// The same, with the entry at one position left out.
template <class Some>
struct WithoutOne {
  const Some& values;
  std::int32_t without;

  const unsigned char* at(std::int32_t position) const noexcept {
    return values.at(position < without ? position : position + 1);
  }
};

// ---- Searching ----------------------------------------------------------------------------------

// Integers and texts are totally ordered: finds the first entry that is not less than the key.
template <class Some, class Key>
Found search_entries(const Some& values, std::int32_t count, const Key& key) noexcept
    requires(Key::kTotalOrder) {
  std::int32_t position = count;
  // Check for a key after the last entry first: rows are often inserted in the order of their
  // values.
  if (!key.is_above(values.at(count - 1))) {
    position = count_less(count, [&](std::int32_t at) { return key.is_above(values.at(at)); });
  }
  return {position, position < count && key.equals(values.at(position))};
}

// Reals and doubles: exactly this sequence of probes is required, because equality within a
// tolerance is not transitive and NaN equals everything.
template <class Some, class Key>
Found search_entries(const Some& values, std::int32_t count, const Key& key) noexcept {
  std::int32_t low = 0, high = count - 1;
  while (low <= high) {
    std::int32_t middle = low + (high - low) / 2;
    const int answer = key.compare(values.at(middle));
    if (answer == 0) {
      // Step back to the first equal entry; the entry before `low` is less.
      while (middle > low && key.equals(values.at(middle - 1))) --middle;
      return {middle, true};
    }
    if (answer < 0) {
      low = middle + 1;
    } else {
      high = middle - 1;
    }
  }
  return {low, false};
}

// A totally ordered column whose index is in blocks: uses the keys that the blocks keep for
// integers.
template <class Key>
IndexPlace search_blocks(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                         const Key& key) noexcept {
  const Values values = values_of(table, column);
  if constexpr (Key::kIsNumber) {
    using T = typename Key::Number;
    const auto value_of = [&](std::int32_t slot) { return load<T>(values.of(slot)); };
    const SequencePlace place =
        search_keys(column.index, table.num_rows, value_of,
                    [&](T value, std::int32_t) { return key.is_above(value); });
    return {place,
            place.position < table.num_rows && key.equals(key_at(column.index, place, value_of))};
  } else {
    const SequencePlace place = search_items(column.index, table.num_rows, [&](std::int32_t slot) {
      return key.is_above(values.of(slot));
    });
    return {place,
            place.position < table.num_rows && key.equals(values.of(column.index.at(place)))};
  }
}

// Searches all entries. Reals in blocks are looked up probe by probe.
template <class Key>
IndexPlace search_all(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                      const Key& key) noexcept {
  if constexpr (Key::kTotalOrder) {
    if (column.index.blocks != nullptr) return search_blocks(table, column, key);
  }
  Found found;
  if (column.index.items != nullptr) {  // the usual case: avoids checking the state at each probe
    const ValuesOfEntries values{values_of(table, column), column.index.items};
    found = search_entries(values, table.num_rows, key);
  } else {
    found = search_entries(entries_of(table, column), table.num_rows, key);
  }
  return {{found.position}, found.equal};
}

// Searches all entries except the one at position `without`, probe by probe.
template <class Key>
Found search_all_others(const TEVPF_TABLE& table, const TEVPF_COLUMN& column, std::int32_t without,
                        const Key& key) noexcept {
  const ValuesOfIndex all = entries_of(table, column);
  return search_entries(WithoutOne<ValuesOfIndex>{all, without}, table.num_rows - 1, key);
}

// Whether the value at a position, or at the end, equals the key.
template <class Key>
bool equals_at(const TEVPF_TABLE& table, const TEVPF_COLUMN& column, std::int32_t position,
               const Key& key) noexcept {
  if (position >= table.num_rows) return false;
  const Values values = values_of(table, column);
  if constexpr (Key::kIsNumber) {
    using T = typename Key::Number;
    return key.equals(key_at(column.index, position,
                             [&](std::int32_t slot) { return load<T>(values.of(slot)); }));
  } else {
    return key.equals(values.of(column.index.at(position)));
  }
}

// ---- Searching along search keys ----------------------------------------------------------------

// The cost of a search, in rows of a sequential scan.
constexpr std::int64_t kRowsPerSearch = 256;

// Searches integers from position `first` on: the fences first, then the few values that they
// select. The caller wants the row, so the entries of these values are prefetched.
template <class T>
Found search_along_fences(const ValuesInLine<T>& values, std::int32_t first, std::int32_t count,
                          const std::int32_t* entries, const NumberKey<T>& key) noexcept {
  const auto count_below = [&](const ValuesInLine<T>& some, std::int32_t length) {
    return count_less(length, [&](std::int32_t at) { return key.is_above(some.at(at)); });
  };
  const auto count_below_in_step = [&](const ValuesInLine<T>& some) {  // compilers vectorise it
    std::int32_t below = 0;
    for (std::int32_t at = 0; at < kFenceStep; ++at) below += key.is_above(some.at(at)) ? 1 : 0;
    return below;
  };
  const std::int32_t start = kFenceStep * count_below(values.from(count), fence_count(count));
  std::int32_t found = start;
  if (start < count) {
    __builtin_prefetch(entries + start);
    const ValuesInLine<T> rest = values.from(start);
    found +=
        count - start >= kFenceStep ? count_below_in_step(rest) : count_below(rest, count - start);
  }
  found = std::max(first, found);
  return {found, found < count && key.equals(values.at(found))};
}

template <class T>
Found search_along_keys(const unsigned char* keys, std::int32_t first, std::int32_t count,
                        const std::int32_t* entries, const NumberKey<T>& key) noexcept {
  const ValuesInLine<T> values{keys};
  if constexpr (kIsFloating<T>) {
    const Found found = search_entries(values.from(first), count - first, key);
    return {first + found.position, found.equal};
  } else {
    return search_along_fences(values, first, count, entries, key);
  }
}

// The same for a column of any number type whose index is flat.
Found search_with_keys(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                       const unsigned char* keys, std::int32_t first, const void* key) noexcept {
  return with_number(column.def.type, [&](auto tag) {
    const NumberKey<decltype(tag)> prepared(key, column.tolerance);
    return search_along_keys(keys, first, table.num_rows, column.index.items, prepared);
  });
}

}  // namespace

// ---- Searching ----------------------------------------------------------------------------------

IndexPlace search_index(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                        const void* key) noexcept {
  if (table.num_rows < 1) return {{0}, false};
  if (column.index.items != nullptr && column.keys.values != nullptr) {
    const Found found = search_with_keys(table, column, column.keys.values, 0, key);
    return {{found.position}, found.equal};
  }
  return with_key(column.def.type, column.tolerance, key, readable_bytes(table, column),
                  [&](const auto& prepared) { return search_all(table, column, prepared); });
}

Found search_others(const TEVPF_TABLE& table, const TEVPF_COLUMN& column, std::int32_t without,
                    const void* key) noexcept {
  if (table.num_rows < 2) return {0, false};
  return with_key(column.def.type, column.tolerance, key, readable_bytes(table, column),
                  [&]<class Key>(const Key& prepared) -> Found {
                    if constexpr (Key::kTotalOrder) {
                      const IndexPlace whole = search_all(table, column, prepared);
                      const std::int32_t at = whole.place.position;
                      if (at != without) return {at - (without < at ? 1 : 0), whole.found};
                      return {at, equals_at(table, column, at + 1, prepared)};
                    } else {
                      return search_all_others(table, column, without, prepared);
                    }
                  });
}

std::int32_t position_among_others(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                                   std::int32_t without, const void* key) noexcept {
  return with_key(column.def.type, column.tolerance, key, readable_bytes(table, column),
                  [&]<class Key>(const Key& prepared) -> std::int32_t {
                    if constexpr (Key::kTotalOrder) {
                      const std::int32_t at = search_all(table, column, prepared).place.position;
                      return at - (without < at ? 1 : 0);
                    } else {
                      return search_all_others(table, column, without, prepared).position;
                    }
                  });
}

Found find_in_index(const TEVPF_TABLE& table, TEVPF_COLUMN& column, std::int32_t first,
                    const void* key) noexcept {
  const std::int32_t count = table.num_rows;
  const std::int32_t* const entries = column.index.items;
  if (entries != nullptr && column.def.type != PF_TYPE_STRING) {
    count_search(column, kRowsPerSearch);
    if (const unsigned char* const keys = search_keys(table, column, entries)) {
      return search_with_keys(table, column, keys, first, key);
    }
  }
  return with_key(column.def.type, column.tolerance, key, readable_bytes(table, column),
                  [&]<class Key>(const Key& prepared) -> Found {
                    const ValuesOfIndex values = entries_of(table, column);
                    if constexpr (Key::kTotalOrder) {
                      const IndexPlace whole = search_all(table, column, prepared);
                      if (whole.found) (void)column.index.at(whole.place);  // its row is read next
                      if (whole.place.position >= first) return {whole.place.position, whole.found};
                      return {first, prepared.equals(values.at(first))};
                    } else {
                      const auto from = [&](std::int32_t at) { return values.at(first + at); };
                      const ValuesFrom<decltype(from)> rest{from};
                      const Found found = search_entries(rest, count - first, prepared);
                      return {first + found.position, found.equal};
                    }
                  });
}

// An entry is among those of equal value, usually near the first. Where many are equal, or values
// have drifted within the tolerance, the sequence finds it.
SequencePlace entry_of(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                       std::int32_t slot) noexcept {
  constexpr std::int32_t kNear = 16;
  const void* const value = values_of(table, column).of(slot);
  const IndexPlace first = search_index(table, column, value);
  if (first.found) {
    const std::int32_t at = first.place.position;
    if (column.index.at(first.place) == slot) return first.place;
    const std::int32_t end = std::min(table.num_rows, at + kNear);
    for (std::int32_t next = at + 1; next < end; ++next) {
      if (column.index.at(next) == slot) return column.index.place_at(next);
    }
  }
  return column.index.place_of(table.num_rows, slot);
}

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_binary_search(int32_t type, double tolerance, int32_t count, int32_t row_wid,
                                  const int32_t* index, const void* column_base, const void* key,
                                  int32_t* pos_out) noexcept {
  if (count < 1) {
    *pos_out = 0;
    return PF_NOTFOUND;
  }
  if (!is_value_type(type)) return PF_CMPFAIL;
  const ValuesOfEntries values{{static_cast<const unsigned char*>(column_base), row_wid}, index};
  return with_key(type, tolerance, key, 0, [&](const auto& prepared) -> TEVPF_STATUS {
    const Found found = search_entries(values, count, prepared);
    *pos_out = found.position;
    return found.equal ? PF_NORMAL : PF_NOTFOUND;
  });
}
