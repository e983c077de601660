// Cuts lines that are too wide for a page into segments of whole columns. Each segment's lines are
// indented one tab more than those of the previous segment, up to two tabs, and their maximum
// length is reduced by that indent.
#pragma once

#include <cstdint>
#include <string_view>

#include "core/base/heap.h"
#include "reports/row_text.h"
#include "reports/text_out.h"

namespace tevpf {

// The page widths of dumps and listings.
struct PageRules {
  std::int32_t one_line;  // the widest row that is not cut
  // Each segment, including its gap, is shorter than a limit. The limit is first_limit for the
  // first segment and 8 less for each further one, but at least least_limit.
  std::int32_t first_limit;
  std::int32_t least_limit;
  std::int64_t most_dashes;  // in the rule under a segment's heading
  bool keep_words;           // a piece of a row does not end before white space or with a backslash
};

inline constexpr PageRules kDumpPage = {130, 129, 113, 129, true};
inline constexpr PageRules kListingPage = {132, 131, 115, INT64_MAX, false};

class Segments {
 public:
  // Cuts a row into one segment, or into as many as needed when it is wider than a line. Returns
  // false when out of memory.
  [[nodiscard]] bool cut(const RowText& rows, std::int64_t row_width,
                         const PageRules& rules) noexcept;

  void write_heading(TextOut& out, std::string_view line) const noexcept;
  void write_row(TextOut& out, std::string_view line) const noexcept;

 private:
  std::int64_t piece_length(std::string_view rest, std::int32_t segment) const noexcept;

  const PageRules* rules_ = nullptr;
  std::int64_t row_width_ = 0;
  std::int32_t count_ = 1;
  Owned<std::int64_t> lengths_;  // null if one segment holds the whole row
};

}  // namespace tevpf
