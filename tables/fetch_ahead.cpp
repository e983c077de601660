#include "tables/fetch_ahead.h"

#include <cstdint>

#include "core/sequence/sequence_search.h"
#include "tables/layout.h"
#include "values/compare.h"

namespace tevpf {
namespace {

// Smaller tables fit the cache.
#ifdef TEVPF_TEST_HOOKS
constexpr std::int32_t kRowsWorthFetching = 0;
#else
constexpr std::int32_t kRowsWorthFetching = 50'000;
#endif

// A few searches that are about to be made, of indexes in blocks with keys: what other searches
// will read is not known.
class SearchesAhead {
 public:
  void add(const TEVPF_COLUMN& column, const unsigned char* row) noexcept {
    const bool has_keys = is_indexed(column) && column.index.blocks != nullptr &&
                          is_number_type(column.def.type) && !is_floating_type(column.def.type);
    if (has_keys && count_ < kMost) all_[count_++] = {&column, row, {}};
  }

  void fetch() noexcept {
    if (count_ < 2) return;
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

 private:
  struct Search {
    const TEVPF_COLUMN* column;
    const unsigned char* row;
    SearchAhead ahead;
  };

  template <class Step>
  void for_each(Step step) noexcept {
    for (std::int32_t i = 0; i < count_; ++i) {
      const TEVPF_COLUMN& column = *all_[i].column;
      with_number(column.def.type, [&](auto tag) {
        using T = decltype(tag);
        const NumberKey<T> key(all_[i].row + column.offset, column.tolerance);
        step(all_[i].ahead, *column.index.blocks, tag,
             [&](T value) { return key.is_above(value); });
      });
    }
  }

  static constexpr std::int32_t kMost = 4;
  std::int32_t count_ = 0;
  Search all_[kMost];
};

}  // namespace

void fetch_places(const TEVPF_TABLE& table, const unsigned char* row) noexcept {
  if (table.num_rows < kRowsWorthFetching) return;
  SearchesAhead searches;
  for (std::int32_t i = 0; i < table.num_cols; ++i) searches.add(table.col_array[i], row);
  searches.fetch();
}

void fetch_places_of_changes(const TEVPF_TABLE& table, const unsigned char* row,
                             const unsigned char* other_row) noexcept {
  if (table.num_rows < kRowsWorthFetching) return;
  SearchesAhead searches;
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    const TEVPF_COLUMN& column = table.col_array[i];
    if (has_same_bytes(column, row, other_row)) continue;
    searches.add(column, row);
    searches.add(column, other_row);
  }
  searches.fetch();
}

}  // namespace tevpf
