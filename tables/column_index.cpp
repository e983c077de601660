#include "tables/column_index.h"

#include <algorithm>
#include <cstring>
#include <limits>
#include <utility>

#include "core/base/status.h"
#include "tables/row_order.h"
#include "tables/row_store.h"
#include "tables/search_keys.h"
#include "values/compare.h"

namespace tevpf {
namespace {

// The values of a column in the order of its index, from some position on: through the index to the
// rows, or side by side.
struct ValuesByRow {
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

// ---- Searching ----------------------------------------------------------------------------------

// Integers: the first entry that is not less. Their order is total, so the answer is that of the
// probes below. Three probes a step, which wait for memory together, quarter what is left; no
// branch depends on a value.
template <class Values, class T>
TEVPF_STATUS search_entries(const Values& values, std::int32_t count, const NumberKey<T>& key,
                            std::int32_t& pos) noexcept requires(!kIsFloating<T>) {
  // Behind all of them: rows that come in the order of their values.
  if (key.is_above(values.at(count - 1))) {
    pos = count;
    return PF_NOTFOUND;
  }
  std::int32_t first = 0;  // the answer is one of `length` entries from there on, or behind them
  std::int32_t length = count;
  const auto less = [&](std::int32_t place) {
    return static_cast<std::int32_t>(key.is_above(values.at(first + place - 1)));
  };
  while (length >= 4) {
    const std::int32_t quarter = length / 4;
    first += quarter * (less(quarter) + less(2 * quarter) + less(3 * quarter));
    length -= 3 * quarter;
  }
  std::int32_t behind = 0;
  for (std::int32_t place = 1; place <= length; ++place) behind += less(place);
  first += behind;
  pos = first;
  return pos < count && key.equals(values.at(pos)) ? PF_NORMAL : PF_NOTFOUND;
}

// Steps back over equal entries to the first of them; the entry in front of `low` is less.
template <class Values, class Key>
std::int32_t first_equal(const Values& values, std::int32_t low, std::int32_t found,
                         const Key& key) noexcept {
  while (found > low && key.equals(values.at(found - 1))) --found;
  return found;
}

// Equal texts stand together, however many match a pattern: the first of them is found by halving.
template <class Values, bool kWide>
std::int32_t first_equal(const Values& values, std::int32_t low, std::int32_t found,
                         const TextKey<kWide>& key) noexcept {
  while (low < found) {
    const std::int32_t middle = low + (found - low) / 2;
    if (key.equals(values.at(middle))) {
      found = middle;
    } else {
      low = middle + 1;
    }
  }
  return found;
}

// Reals, doubles and texts: these probes and no others, because equality within a tolerance chains
// and what is not a number equals everything.
template <class Values, class Key>
TEVPF_STATUS search_entries(const Values& values, std::int32_t count, const Key& key,
                            std::int32_t& pos) noexcept {
  std::int32_t low = 0, high = count - 1;
  while (low <= high) {
    const std::int32_t middle = low + (high - low) / 2;
    const int answer = key.compare(values.at(middle));
    if (answer == 0) {
      pos = first_equal(values, low, middle, key);
      return PF_NORMAL;
    }
    if (answer < 0) {
      low = middle + 1;
    } else {
      high = middle - 1;
    }
  }
  pos = low;
  return PF_NOTFOUND;
}

// ---- Searching along search keys ----------------------------------------------------------------

// What a search costs, as so many rows looked at one after the other.
constexpr std::int64_t kRowsPerSearch = 256;

// Integers from position `first` on: along the fences of all, then among the few values that they lead
// to. Whoever searches wants the row, so the index entries that belong to these are asked for at once.
template <class T>
TEVPF_STATUS search_along_fences(const ValuesInLine<T>& values, std::int32_t first,
                                 std::int32_t count, const std::int32_t* entries,
                                 const NumberKey<T>& key, std::int32_t& pos) noexcept {
  std::int32_t fence = 0, place = 0;
  (void)search_entries(values.from(count), fence_count(count), key, fence);
  const std::int32_t start = fence * kFenceStep;
  if (start < count) {
    __builtin_prefetch(entries + start);
    (void)search_entries(values.from(start), std::min(kFenceStep, count - start), key, place);
  }
  const std::int32_t found = std::max(first, start + place);
  pos = found - first;
  return found < count && key.equals(values.at(found)) ? PF_NORMAL : PF_NOTFOUND;
}

// What TEV8R1_sort_comp compares: the column whose index was built last.
struct SortContext {
  Values values;
  std::int32_t type;
  double tolerance;
};
SortContext sort_context{{nullptr, 0}, PF_TYPE_INT, 0.0};

// ---- Blocks -------------------------------------------------------------------------------------

// A block of `room` entries, those from `used` on zero; room 0: none. False when there is no
// memory.
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

bool reserve_entries(TEVPF_COLUMN& column, std::int64_t needed) noexcept {
  if (column.index_room >= needed && column.idx_ptr != nullptr) return true;
  constexpr std::int64_t most = std::numeric_limits<std::int32_t>::max();
  if (needed > most) return false;
  const std::int64_t room = std::min(grown_room(column.index_room, needed), most);
  void* const block = heap_resize(column.idx_ptr, static_cast<std::uint64_t>(room), 4);
  if (block == nullptr) return false;
  column.idx_ptr = static_cast<std::int32_t*>(block);
  column.index_room = static_cast<std::int32_t>(room);
  return true;
}

// ---- Passes over entries, written so that the compiler makes vectors of them --------------------

constexpr std::int32_t kBlock = 64;

// Lowers by one every entry above `row` up to the entry that is `row`, and returns its position;
// count when there is none.
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

// Takes a row out of `count` entries, lowers those above it, and returns where it stood.
std::int32_t remove_row(std::int32_t* entries, std::int32_t count, std::int32_t row) noexcept {
  const std::int32_t position = lower_up_to(entries, count, row);
  for (std::int32_t i = position; i < count - 1; ++i) {
    const std::int32_t next = entries[i + 1];
    entries[i] = next - (next > row ? 1 : 0);
  }
  return position;
}

// Whether the comparison of some entry's value with that of the next one passes the test.
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

void move_entries(std::int32_t* to, const std::int32_t* from, std::int32_t count) noexcept {
  std::memmove(to, from, static_cast<std::size_t>(count) * sizeof *to);
}

}  // namespace

// ---- Whole indexes ------------------------------------------------------------------------------

bool build_index(const TEVPF_TABLE& table, const TEVPF_COLUMN& column, std::int64_t room,
                 NewIndex& out) noexcept {
  if (!make_block(table.num_rows, room, out)) return false;
  return !out.entries || sort_rows(table, column, out.entries.get());
}

bool make_identity_index(std::int32_t count, std::int64_t room, NewIndex& out) noexcept {
  if (!make_block(count, room, out)) return false;
  if (out.entries) fill_identity(out.entries.get(), count);
  return true;
}

bool copy_index(const TEVPF_COLUMN& column, std::int32_t count, NewIndex& out) noexcept {
  if (!make_block(count, count, out)) return false;
  if (out.entries) move_entries(out.entries.get(), column.idx_ptr, count);
  return true;
}

void adopt_index(TEVPF_COLUMN& column, NewIndex index) noexcept {
  drop_search_keys(column);
  heap_free(column.idx_ptr);
  column.idx_ptr = index.entries.release();
  column.index_room = index.room;
}

void release_index(TEVPF_COLUMN& column) noexcept { adopt_index(column, NewIndex{}); }

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

bool reserve_index_entries(TEVPF_TABLE& table, std::int32_t rows) noexcept {
  const std::int64_t needed = std::int64_t{table.num_rows} + rows;
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    TEVPF_COLUMN& column = table.col_array[i];
    if (is_indexed(column) && !reserve_entries(column, needed)) return false;
  }
  return true;
}

// ---- Entries ------------------------------------------------------------------------------------

TEVPF_STATUS search_index(const TEVPF_TABLE& table, const TEVPF_COLUMN& column, std::int32_t first,
                          std::int32_t count, const void* key, std::int32_t& pos) noexcept {
  pos = 0;
  if (count < 1) return PF_NOTFOUND;
  const ValuesByRow values{values_of(table, column), column.idx_ptr + first};
  return with_key(
      column.def.type, column.tolerance, key, readable_bytes(table, column),
      [&](const auto& prepared) { return search_entries(values, count, prepared, pos); });
}

TEVPF_STATUS find_in_index(const TEVPF_TABLE& table, TEVPF_COLUMN& column, std::int32_t first,
                           std::int32_t count, const void* key, std::int32_t& pos) noexcept {
  if (column.def.type == PF_TYPE_STRING) return search_index(table, column, first, count, key, pos);
  pos = 0;
  if (count < 1) return PF_NOTFOUND;
  count_search(column, kRowsPerSearch);
  const unsigned char* const keys = search_keys(table, column, column.idx_ptr);
  if (keys == nullptr) return search_index(table, column, first, count, key, pos);
  return with_number(column.def.type, [&](auto tag) {
    using T = decltype(tag);
    const ValuesInLine<T> values{keys};
    const NumberKey<T> prepared(key, column.tolerance);
    if constexpr (kIsFloating<T>) {
      return search_entries(values.from(first), count, prepared, pos);
    } else {
      return search_along_fences(values, first, first + count, column.idx_ptr, prepared, pos);
    }
  });
}

void renumber_for_insertion(TEVPF_TABLE& table, std::int32_t row_number) noexcept {
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    if (!is_indexed(table.col_array[i])) continue;
    std::int32_t* const entries = table.col_array[i].idx_ptr;
    for (std::int32_t k = 0; k < table.num_rows; ++k)
      entries[k] += entries[k] >= row_number ? 1 : 0;
  }
}

void insert_entry(TEVPF_COLUMN& column, std::int32_t count, std::int32_t position,
                  std::int32_t row_number) noexcept {
  std::int32_t* const place = column.idx_ptr + position;
  move_entries(place + 1, place, count - position);
  *place = row_number;
}

void remove_row_from_indexes(TEVPF_TABLE& table, std::int32_t row_number,
                             std::int32_t* positions) noexcept {
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    if (!is_indexed(table.col_array[i])) continue;
    const std::int32_t position =
        remove_row(table.col_array[i].idx_ptr, table.num_rows, row_number);
    if (positions != nullptr) positions[i] = position;
  }
}

void move_entry(const TEVPF_TABLE& table, TEVPF_COLUMN& column, std::int32_t row_number,
                const void* value) noexcept {
  const std::int32_t count = table.num_rows;
  const unsigned char* const stored = values_of(table, column).of(row_number);
  std::int32_t first = 0;
  if (search_index(table, column, 0, count, stored, first) != PF_NORMAL) first = 0;
  const NumberKey<std::int32_t> entry(&row_number, 0);
  std::int32_t position = find_in_line(column.idx_ptr, count, first, entry);
  // Values that drifted within the tolerance can stand where their search does not lead.
  if (position == count) position = find_in_line(column.idx_ptr, first, 0, entry);

  std::int32_t* const place = column.idx_ptr + position;
  move_entries(place, place + 1, count - 1 - position);
  std::int32_t target = 0;
  (void)search_index(table, column, 0, count - 1, value, target);
  insert_entry(column, count - 1, target, row_number);
}

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_create_index(TEVPF_TABLE* table, TEVPF_COLUMN* column) noexcept {
  const std::int64_t room = std::int64_t{table->num_rows} + table->free_rows;
  if (room < 1) return PF_NORMAL;
  sort_context = {values_of(*table, *column), column->def.type, column->tolerance};
  NewIndex index;
  if (!build_index(*table, *column, room, index)) return fail_empty(PF_NOMEM);
  adopt_index(*column, std::move(index));
  return PF_NORMAL;
}

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
  const ValuesByRow values{{static_cast<const unsigned char*>(column_base), row_wid}, index};
  return with_key(type, tolerance, key, 0, [&](const auto& prepared) {
    return search_entries(values, count, prepared, *pos_out);
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
