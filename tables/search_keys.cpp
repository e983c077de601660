#include "tables/search_keys.h"

#include <algorithm>
#include <cstring>

#include "tables/row_store.h"
#include "values/value_type.h"

namespace tevpf {
namespace {

// Gathering takes about as long as the searches before it have taken: both take 5 ms with a million
// rows stored in key order, a twentieth of that with ten thousand, and more beyond a million. So
// keys that the next change drops at once add about as much time as was spent without them. Small
// tables fit the cache anyway.
#ifdef TEVPF_TEST_HOOKS
constexpr std::int64_t kEffortBeforeKeys = 1;
constexpr std::int32_t kRowsWorthKeys = 4;
#else
constexpr std::int64_t kEffortBeforeKeys = std::int64_t{1} << 20;
constexpr std::int32_t kRowsWorthKeys = 1024;
#endif
static_assert(kRowsWorthKeys >= kFenceStep, "who searches along fences need not ask for one");

// An index can name the row about to be added before the row itself exists; it needs a value too.
constexpr std::int32_t kRowToCome = 1;

unsigned char* gather_by_row(const TEVPF_TABLE& table, const TEVPF_COLUMN& column) noexcept {
  const auto rows = static_cast<std::size_t>(table.num_rows);
  const auto size = static_cast<std::size_t>(value_type(column.def.type).size);
  auto* const values =
      static_cast<unsigned char*>(heap_alloc(std::uint64_t{rows} + kRowToCome, size));
  if (values == nullptr) return nullptr;
  copy_values(table, column, values);
  std::memset(values + rows * size, 0, size);
  return values;
}

template <class T>
void add_fences(T* values, std::int32_t count) noexcept {
  T* const behind = values + count;
  for (std::int32_t i = 0; i < fence_count(count); ++i)
    behind[i] = values[(i + 1) * kFenceStep - 1];
}

template <class T>
unsigned char* gather_by_index(const Values& stored, const std::int32_t* index,
                               std::int32_t count) noexcept {
  const std::int32_t fences = kIsFloating<T> ? 0 : fence_count(count);
  auto values = new_array<T>(static_cast<std::uint64_t>(count) + fences);
  if (!values) return nullptr;
  for (std::int32_t i = 0; i < count; ++i) values[i] = load<T>(stored.of(index[i]));
  if constexpr (!kIsFloating<T>) add_fences(values.get(), count);
  return reinterpret_cast<unsigned char*>(values.release());
}

}  // namespace

const unsigned char* search_keys(const TEVPF_TABLE& table, TEVPF_COLUMN& column,
                                 const std::int32_t* index) noexcept {
  if (column.keys.values != nullptr) return column.keys.values;
  const std::int32_t count = table.num_rows;
  const std::int64_t enough = std::max<std::int64_t>(kEffortBeforeKeys, count);
  if (count < kRowsWorthKeys || column.keys.effort < enough) return nullptr;
  column.keys.effort = 0;  // do not retry at once when out of memory
  if (index == nullptr) {
    column.keys.values = gather_by_row(table, column);
  } else {
    column.keys.values = with_number(column.def.type, [&](auto tag) {
      return gather_by_index<decltype(tag)>(values_of(table, column), index, count);
    });
  }
  return column.keys.values;
}

Owned<unsigned char> new_search_keys(const TEVPF_COLUMN& column, std::int32_t count) noexcept {
  const std::int32_t type = column.def.type;
  if (count < kRowsWorthKeys || !is_number_type(type) || is_floating_type(type)) return nullptr;
  const auto size = static_cast<std::uint64_t>(value_type(type).size);
  return Owned<unsigned char>(static_cast<unsigned char*>(heap_alloc(
      static_cast<std::uint64_t>(count) + static_cast<std::uint64_t>(fence_count(count)), size)));
}

void add_fences(const TEVPF_COLUMN& column, std::int32_t count, unsigned char* values) noexcept {
  with_number(column.def.type, [&](auto tag) {
    using T = decltype(tag);
    if constexpr (!kIsFloating<T>) add_fences(reinterpret_cast<T*>(values), count);
  });
}

}  // namespace tevpf
