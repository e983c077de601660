#include "tables/column_index.h"

#include <algorithm>
#include <cstring>
#include <limits>
#include <utility>

#include "core/base/status.h"
#include "core/sequence/sequence_search.h"
#include "tables/row_order.h"
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

// The column that TEV8R1_sort_comp compares by: the one whose index was built last.
struct SortContext {
  Values values;
  std::int32_t type;
  double tolerance;
};
SortContext sort_context{{nullptr, 0}, PF_TYPE_INT, 0.0};

// ---- Blocks -------------------------------------------------------------------------------------

// Allocates a block of `room` entries, zeroed after the first `used`; with room 0, no block.
// Returns false when out of memory.
bool make_block(std::int64_t used, std::int64_t room, NewIndex& out) noexcept {
  out = NewIndex{};
  if (room <= 0) return true;
  if (room > std::numeric_limits<std::int32_t>::max()) return false;
  out.entries = new_array<std::int32_t>(static_cast<std::uint64_t>(room));
  if (!out.entries) return false;
  std::fill(out.entries.get() + used, out.entries.get() + room, 0);
  out.room = static_cast<std::int32_t>(room);
  return true;
}

void fill_identity(std::int32_t* entries, std::int32_t count) noexcept {
  for (std::int32_t i = 0; i < count; ++i) entries[i] = i;
}

// ---- Passes over entries, written so that the compiler vectorizes them --------------------------

constexpr std::int32_t kBlock = 64;

// Decrements every entry above `row` up to the entry equal to `row`, and returns its position, or
// count if there is none.
std::int32_t lower_up_to(std::int32_t* entries, std::int32_t count, std::int32_t row) noexcept {
  std::int32_t at = 0;
  for (; count - at >= kBlock; at += kBlock) {
    std::uint32_t seen = 0;
    for (std::int32_t i = 0; i < kBlock; ++i) seen |= entries[at + i] == row ? 1u : 0u;
    if (seen != 0) break;
    for (std::int32_t i = 0; i < kBlock; ++i) entries[at + i] -= entries[at + i] > row ? 1 : 0;
  }
  for (; at < count && entries[at] != row; ++at) entries[at] -= entries[at] > row ? 1 : 0;
  return at;
}

// Removes a row from `count` entries, decrements the entries above it, and returns its position.
std::int32_t remove_row(std::int32_t* entries, std::int32_t count, std::int32_t row) noexcept {
  const std::int32_t position = lower_up_to(entries, count, row);
  for (std::int32_t i = position; i < count - 1; ++i) {
    const std::int32_t next = entries[i + 1];
    entries[i] = next - (next > row ? 1 : 0);
  }
  return position;
}

// Whether comparing any entry's value with the next one's passes the test.
template <class Test>
bool some_neighbours(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                     const std::int32_t* entries, double tolerance, Test test) noexcept {
  const Values values = values_of(table, column);
  const auto any = [&](auto compare) {
    for (std::int32_t i = 0; i + 1 < table.num_rows; ++i) {
      if (test(compare(values.of(entries[i]), values.of(entries[i + 1])))) return true;
    }
    return false;
  };
  if (column.def.type == PF_TYPE_STRING) {
    return any([](const unsigned char* a, const unsigned char* b) {
      return compare_text(reinterpret_cast<const char*>(a),
                          make_pattern(reinterpret_cast<const char*>(b)));
    });
  }
  return with_number(column.def.type, [&](auto tag) {
    using T = decltype(tag);
    return any([&](const unsigned char* a, const unsigned char* b) {
      return compare_numbers(load<T>(a), load<T>(b), tolerance);
    });
  });
}

// Search keys belong to a flat index. Blocks made of an index of integers continue to use them.
void pass_on_search_keys(TEVPF_COLUMN& column) noexcept {
  if (column.index.blocks == nullptr || column.keys.values == nullptr) return;
  if (is_floating_type(column.def.type)) return;
  column.index.blocks->adopt_keys(column.keys.values, value_type(column.def.type).size);
  column.keys = {};
}

// The value as the key that blocks keep for it; null for texts, for which blocks keep no keys.
const void* key_of_value(const TEVPF_COLUMN& column, const void* value) noexcept {
  return column.def.type == PF_TYPE_STRING ? nullptr : value;
}

}  // namespace

// ---- Whole indexes ------------------------------------------------------------------------------

bool build_index(const TEVPF_TABLE& table, const TEVPF_COLUMN& column, std::int64_t room,
                 NewIndex& out) noexcept {
  if (!make_block(table.num_rows, room, out)) return false;
  if (!out.entries) return true;
  out.keys = new_search_keys(column, table.num_rows);
  if (!sort_rows(table, column, out.entries.get(), out.keys.get())) return false;
  if (out.keys) add_fences(column, table.num_rows, out.keys.get());
  return true;
}

void sort_from_now_on(const TEVPF_TABLE& table, const TEVPF_COLUMN& column) noexcept {
  sort_context = {values_of(table, column), column.def.type, column.tolerance};
}

bool make_identity_index(std::int32_t count, std::int64_t room, NewIndex& out) noexcept {
  if (!make_block(count, room, out)) return false;
  if (out.entries) fill_identity(out.entries.get(), count);
  return true;
}

bool copy_index(const TEVPF_COLUMN& column, std::int32_t count, NewIndex& out) noexcept {
  if (!make_block(count, count, out)) return false;
  if (out.entries) column.index.copy_items(count, out.entries.get());
  return true;
}

void adopt_index(TEVPF_COLUMN& column, NewIndex index) noexcept {
  drop_search_keys(column);
  column.index.adopt(std::move(index.entries), index.room);
  column.keys.values = index.keys.release();
}

void release_index(TEVPF_COLUMN& column) noexcept {
  drop_search_keys(column);
  column.index.clear();
}

bool is_index_in_order(const TEVPF_TABLE& table, const TEVPF_COLUMN& column,
                       double tolerance) noexcept {
  return !some_neighbours(table, column, column.idx_ptr, tolerance,
                          [](int order) { return order > 0; });
}

bool has_equal_neighbours(const TEVPF_TABLE& table, const std::int32_t* entries,
                          const TEVPF_COLUMN& column) noexcept {
  return some_neighbours(table, column, entries, column.tolerance,
                         [](int order) { return order == 0; });
}

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

IndexPlace search_others(const TEVPF_TABLE& table, const TEVPF_COLUMN& column, std::int32_t without,
                         const void* key) noexcept {
  const std::int32_t others = table.num_rows - 1;
  if (others < 1) return {{0}, false};
  return with_key(column.def.type, column.tolerance, key, readable_bytes(table, column),
                  [&]<class Key>(const Key& prepared) -> IndexPlace {
                    const ValuesOfIndex all = entries_of(table, column);
                    const WithoutOne<ValuesOfIndex> values{all, without};
                    if constexpr (Key::kTotalOrder) {
                      const IndexPlace whole = search_all(table, column, prepared);
                      const std::int32_t at =
                          whole.place.position - (without < whole.place.position ? 1 : 0);
                      return {{at}, at < others && prepared.equals(values.at(at))};
                    } else {
                      const Found found = search_entries(values, others, prepared);
                      return {{found.position}, found.equal};
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

// Smaller tables fit the cache.
#ifdef TEVPF_TEST_HOOKS
constexpr std::int32_t kRowsWorthFetching = 0;
#else
constexpr std::int32_t kRowsWorthFetching = 50'000;
#endif

void fetch_places(const TEVPF_TABLE& table, const unsigned char* row) noexcept {
  constexpr std::int32_t kMost = 4;
  if (table.num_rows < kRowsWorthFetching) return;
  const TEVPF_COLUMN* columns[kMost];
  SearchAhead searches[kMost];
  std::int32_t count = 0;
  for (std::int32_t i = 0; i < table.num_cols && count < kMost; ++i) {
    const TEVPF_COLUMN& column = table.col_array[i];
    const bool has_keys = is_indexed(column) && column.index.blocks != nullptr &&
                          is_number_type(column.def.type) && !is_floating_type(column.def.type);
    if (has_keys) columns[count++] = &column;
  }
  if (count < 2) return;
  const auto for_each = [&](auto step) {
    for (std::int32_t i = 0; i < count; ++i) {
      const TEVPF_COLUMN& column = *columns[i];
      with_number(column.def.type, [&](auto tag) {
        using T = decltype(tag);
        const NumberKey<T> key(row + column.offset, column.tolerance);
        step(searches[i], *column.index.blocks, tag, [&](T value) { return key.is_above(value); });
      });
    }
  };
  for_each([](SearchAhead& search, const SequenceBlocks& blocks, auto tag, auto is_less) {
    search.fetch_group<decltype(tag)>(blocks, is_less);
  });
  for_each([](SearchAhead& search, const SequenceBlocks&, auto tag, auto is_less) {
    search.fetch_block<decltype(tag)>(is_less);
  });
  for_each([](SearchAhead& search, const SequenceBlocks&, auto tag, auto) {
    search.fetch_keys<decltype(tag)>();
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

// ---- Entries ------------------------------------------------------------------------------------

bool ready_to_insert_entry(const TEVPF_TABLE& table, TEVPF_COLUMN& column,
                           const SequencePlace& place, std::int32_t slot) noexcept {
  if (!column.index.make_ready_to_insert(table.num_rows, place.position, slot)) return false;
  pass_on_search_keys(column);
  return true;
}

bool ready_to_erase_entry(const TEVPF_TABLE& table, TEVPF_COLUMN& column,
                          const SequencePlace& place) noexcept {
  if (!column.index.make_ready_to_erase(table.num_rows, place.position)) return false;
  pass_on_search_keys(column);
  return true;
}

bool ready_to_move_entry(const TEVPF_TABLE& table, TEVPF_COLUMN& column, EntryMove move) noexcept {
  if (!column.index.make_ready_to_move(table.num_rows, move.from, move.to)) return false;
  pass_on_search_keys(column);
  return true;
}

void insert_entry(const TEVPF_TABLE& table, TEVPF_COLUMN& column, SequencePlace place,
                  std::int32_t slot, const void* value) noexcept {
  column.index.insert(table.num_rows, place, slot, key_of_value(column, value));
}

void erase_entry(const TEVPF_TABLE& table, TEVPF_COLUMN& column, SequencePlace place) noexcept {
  column.index.erase(table.num_rows, place);
  if (table.num_rows == 1) column.index.clear();
}

void move_entry(TEVPF_COLUMN& column, EntryMove move, const void* value) noexcept {
  column.index.move(move.from, move.to, key_of_value(column, value));
}

void forget_values(TEVPF_TABLE& table) noexcept {
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    TEVPF_COLUMN& column = table.col_array[i];
    drop_search_keys(column);
    if (column.index.blocks != nullptr) column.index.blocks->drop_all_keys();
  }
}

}  // namespace tevpf

using namespace tevpf;

int32_t TEV8R1_sort_comp(const void* a, const void* b) noexcept {
  const Values& values = sort_context.values;
  const TEVPF_STATUS order = TEV8R1_compare(sort_context.type, values.of(load<int32_t>(a)),
                                            values.of(load<int32_t>(b)), sort_context.tolerance);
  return order == PF_NORMAL ? 0 : static_cast<int32_t>(order);
}

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

TEVPF_STATUS TEV8R1_remove_index(int32_t* index, int32_t row_number, int32_t count) noexcept {
  remove_row(index, count, row_number);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_adjust_index(int32_t num_rows, int16_t free_rows, int32_t** idx_out) noexcept {
  NewIndex index;
  const int32_t count = std::max(num_rows, 0);
  if (!make_identity_index(count, int64_t{count} + std::max<int16_t>(free_rows, 0), index)) {
    return fail_empty(PF_NOMEM);
  }
  *idx_out = index.entries.release();
  return PF_NORMAL;
}
