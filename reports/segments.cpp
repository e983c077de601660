#include "reports/segments.h"

#include <algorithm>
#include <iterator>

#include "reports/display.h"

namespace tevpf {

namespace {

constexpr std::int32_t kTab = 8;

std::int32_t tabs_of(std::int32_t segment) noexcept { return std::min(segment, 2); }

// Puts columns from `next` on into a segment below the limit, at least one column. Returns the
// segment's length, including the gap after its last column unless that is the last column of all.
std::int64_t fill_segment(const RowText& rows, std::int32_t& next, std::int32_t limit) noexcept {
  const std::int32_t first = next;
  std::int64_t length = 0;
  while (next < rows.count()) {
    const std::int64_t width = display_width(rows.column(next));
    if (next > first && width + length + kColumnGap >= limit) break;
    ++next;
    length += width + (next < rows.count() ? kColumnGap : 0);
  }
  return length;
}

// A line can be shorter than its segments: there are no characters after its end.
char character_at(std::string_view line, std::int64_t place) noexcept {
  return place < std::ssize(line) ? line[static_cast<std::size_t>(place)] : '\0';
}

std::string_view take_front(std::string_view& line, std::int64_t length) noexcept {
  const auto taken = static_cast<std::size_t>(std::min<std::int64_t>(length, std::ssize(line)));
  const std::string_view front(line.data(), taken);
  line.remove_prefix(taken);
  return front;
}

}  // namespace

bool Segments::cut(const RowText& rows, std::int64_t row_width, const PageRules& rules) noexcept {
  rules_ = &rules;
  row_width_ = row_width;
  if (row_width <= rules.one_line) return true;
  lengths_ = new_array<std::int64_t>(static_cast<std::uint64_t>(rows.count()));
  if (!lengths_) return false;
  std::int32_t limit = rules.first_limit;
  count_ = 0;
  for (std::int32_t next = 0; next < rows.count();) {
    lengths_[count_++] = fill_segment(rows, next, limit);
    if (limit > rules.least_limit) limit -= kTab;
  }
  return true;
}

void Segments::write_heading(TextOut& out, std::string_view line) const noexcept {
  if (!lengths_) {
    out.print('.', line, "\n.", Repeat{'-', row_width_ - 1}, '\n');
    return;
  }
  for (std::int32_t s = 0; s < count_; ++s) {
    const std::int64_t dashes = std::min(lengths_[s] - 1, rules_->most_dashes);
    out.print('.', Repeat{'\t', tabs_of(s)}, take_front(line, lengths_[s]), '\n');
    out.print('.', Repeat{'-', dashes}, '\n');
  }
}

void Segments::write_row(TextOut& out, std::string_view line) const noexcept {
  for (std::int32_t s = 0; s + 1 < count_; ++s) {
    const std::int64_t length = piece_length(line, s);
    out.print(' ', Repeat{'\t', tabs_of(s)}, take_front(line, length), "\\\n");
  }
  out.print(' ', Repeat{'\t', tabs_of(count_ - 1)}, line, '\n');
}

// A piece is as long as its segment. If it would end before white space or with a backslash, it is
// extended, as long as it stays below the page's width.
std::int64_t Segments::piece_length(std::string_view rest, std::int32_t segment) const noexcept {
  const std::int64_t whole = lengths_[segment];
  const auto splits_badly = [rest](std::int64_t length) {
    return is_white(character_at(rest, length)) || character_at(rest, length - 1) == '\\';
  };
  if (!rules_->keep_words || !splits_badly(whole)) return whole;
  const std::int64_t most = rules_->first_limit - kTab * tabs_of(segment);
  std::int64_t length = whole + 1;
  while (length < most && splits_badly(length)) ++length;
  return length < most ? length : whole;
}

}  // namespace tevpf
