#include "text_table.h"

#include <algorithm>

#include "text.h"

namespace tool {
namespace {

constexpr std::size_t kGap = 2;               // blanks between columns
constexpr std::string_view kMark = "\u2026";  // for what is cut

}  // namespace

void TextTable::add_column(std::string heading, Align align) {
  heading = visible(heading);
  const std::size_t width = display_width(heading);
  columns_.push_back({std::move(heading), align, width});
}

std::size_t TextTable::total_width() const {
  std::size_t width = is_cut_ ? kGap + display_width(kMark) : 0;
  for (const Column& column : columns_) width += column.width + kGap;
  return width - std::min(width, kGap);
}

void TextTable::shrink_columns() {
  static constexpr std::size_t kShortest = 12;
  if (line_width_ == 0) return;
  while (total_width() > line_width_) {
    Column* widest = nullptr;
    for (Column& column : columns_) {
      if (column.align == Align::kLeft && column.width > kShortest &&
          (widest == nullptr || column.width > widest->width)) {
        widest = &column;
      }
    }
    if (widest != nullptr) {
      const std::size_t excess = total_width() - line_width_;
      widest->width -= std::min(excess, std::max<std::size_t>((widest->width - kShortest) / 2, 1));
    } else if (columns_.size() > 1) {
      columns_.pop_back();
      is_cut_ = true;
    } else {
      return;
    }
  }
}

void TextTable::append(std::string& line, std::size_t column, std::string_view text) const {
  const Column& c = columns_[column];
  std::string shortened;
  if (display_width(text) > c.width) {
    shortened = first_characters(text, c.width - display_width(kMark));
    text = shortened += kMark;
  }
  const std::size_t gap = c.width - std::min(c.width, display_width(text));
  if (column > 0) line.append(kGap, ' ');
  if (c.align == Align::kRight) line.append(gap, ' ');
  line += text;
  if (c.align == Align::kLeft) line.append(gap, ' ');
}

void TextTable::write(Output& output, std::size_t rows, const Cell& cell) {
  for (std::size_t row = 0; row < rows; ++row) {
    for (std::size_t c = 0; c < columns_.size(); ++c) {
      columns_[c].width = std::max(columns_[c].width, display_width(visible(cell(row, c))));
    }
  }
  shrink_columns();
  std::string line;
  const auto end_line = [&] {
    if (is_cut_) line.append(kGap, ' ') += kMark;
    line.erase(line.find_last_not_of(' ') + 1);
    line += '\n';
    output.write(line);
    line.clear();
  };
  if (std::any_of(columns_.begin(), columns_.end(),
                  [](const Column& c) { return !c.heading.empty(); })) {
    for (std::size_t c = 0; c < columns_.size(); ++c) append(line, c, columns_[c].heading);
    end_line();
  }
  for (std::size_t row = 0; row < rows; ++row) {
    for (std::size_t c = 0; c < columns_.size(); ++c) append(line, c, visible(cell(row, c)));
    end_line();
  }
}

}  // namespace tool
