// Lines that are too wide for a page, cut into segments of whole columns. A segment's lines are
// indented by a tab more than those of the segment before, by two at most, and may be so much
// shorter.
#pragma once

#include <cstdint>
#include <string_view>

#include "core/base/heap.h"
#include "reports/row_text.h"
#include "reports/text_out.h"

namespace tevpf {

// How wide the pages of dumps and of listings are.
struct PageRules {
  std::int32_t one_line;  // widest row that is not cut
  // Segments stay below a limit, with their gap: the first below this one, each further one below 8
  // less, but never less than the least.
  std::int32_t first_limit;
  std::int32_t least_limit;
  std::int64_t most_dashes;  // of the rule under a segment's heading
  bool keep_words;  // pieces of rows take in blanks and backslashes that stand at their end
};

inline constexpr PageRules kDumpPage = {130, 129, 113, 129, true};
inline constexpr PageRules kListingPage = {132, 131, 115, INT64_MAX, false};

class Segments {
 public:
  // One segment, or as many as the columns need when a row is wider than a line; false when memory
  // runs out.
  [[nodiscard]] bool cut(const RowText& rows, std::int64_t row_width,
                         const PageRules& rules) noexcept;

  void write_heading(TextOut& out, std::string_view line) const noexcept;
  void write_row(TextOut& out, std::string_view line) const noexcept;

 private:
  std::int64_t piece_length(std::string_view rest, std::int32_t segment) const noexcept;

  const PageRules* rules_ = nullptr;
  std::int64_t row_width_ = 0;
  std::int32_t count_ = 1;
  Owned<std::int64_t> lengths_;  // null while there is one segment of the whole row
};

}  // namespace tevpf
