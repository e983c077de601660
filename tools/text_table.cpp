#include "text_table.h"

#include <algorithm>

#include "text.h"

namespace tool {

void TextTable::add_column(std::string heading, Align align) {
  heading = visible(heading);
  const std::size_t width = display_width(heading);
  columns_.push_back({std::move(heading), align, width});
}

void TextTable::append(std::string& line, std::size_t column, std::string_view text) const {
  const Column& c = columns_[column];
  const std::size_t gap = c.width - std::min(c.width, display_width(text));
  if (column > 0) line += "  ";
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
  std::string line;
  const auto end_line = [&] {
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
