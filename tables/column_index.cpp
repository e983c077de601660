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
