#include "tables/search_keys.h"

#include <algorithm>

#include "tables/row_store.h"
#include "values/value_type.h"

namespace tevpf {
namespace {

// Gathering takes about as long as the searches before it have taken: 5 ms in both with a million rows
// that lie in the order of their keys, a twentieth of it with ten thousand, and beyond a million both
// grow. So keys that the next change drops again cost about as much time as was spent without them.
// Small tables lie in the cache anyway.
#ifdef TEVPF_TEST_HOOKS
constexpr std::int64_t kEffortBeforeKeys = 1;
constexpr std::int32_t kRowsWorthKeys = 4;
#else
constexpr std::int64_t kEffortBeforeKeys = std::int64_t{1} << 20;
constexpr std::int32_t kRowsWorthKeys = 1024;
#endif
static_assert(kRowsWorthKeys >= kFenceStep, "who searches along fences need not ask for one");

// An index can name the row that is about to be added, ahead of the row itself: a value for it too.
constexpr std::int32_t kRowToCome = 1;

template <class T>
void gather(const Values& values, const std::int32_t* order, std::int32_t count, T* out) noexcept {
  if (order == nullptr) {
    for (std::int32_t i = 0; i < count; ++i) out[i] = load<T>(values.of(i));
  } else {
    for (std::int32_t i = 0; i < count; ++i) out[i] = load<T>(values.of(order[i]));
  }
}

}  // namespace

const unsigned char* search_keys(const TEVPF_TABLE& table, TEVPF_COLUMN& column,
                                 const std::int32_t* index) noexcept {
  if (column.keys.values != nullptr) return column.keys.values;
  const std::int32_t count = table.num_rows;
  const std::int64_t enough = std::max<std::int64_t>(kEffortBeforeKeys, count);
  if (count < kRowsWorthKeys || column.keys.effort < enough) return nullptr;
  column.keys.effort = 0;  // not again at once when there is no memory
  const std::int32_t more = index == nullptr                    ? kRowToCome
                            : is_floating_type(column.def.type) ? 0
                                                                : fence_count(count);
  return with_number(column.def.type, [&](auto tag) -> const unsigned char* {
    using T = decltype(tag);
    auto values = new_array<T>(static_cast<std::uint64_t>(count) + more);
    if (!values) return nullptr;
    gather(values_of(table, column), index, count, values.get());
    T* const behind = values.get() + count;
    for (std::int32_t i = 0; i < more; ++i) {
      behind[i] = index == nullptr ? T{} : values[(i + 1) * kFenceStep - 1];
    }
    column.keys.values = reinterpret_cast<unsigned char*>(values.release());
    return column.keys.values;
  });
}

}  // namespace tevpf
