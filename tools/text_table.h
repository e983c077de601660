// Text in aligned columns: numbers to the right, everything else to the left, two blanks between
// them.
#pragma once

#include <cstddef>
#include <functional>
#include <string>
#include <string_view>
#include <vector>

#include "output.h"

namespace tool {

class TextTable {
 public:
  enum class Align { kLeft, kRight };
  void add_column(std::string heading, Align align);

  // Lines are at most so many characters long: texts are cut, then columns left out at the right;
  // a mark stands for what is missing. Numbers are never cut.
  void fit(std::size_t line_width) { line_width_ = line_width; }

  // Writes the headings (unless all are empty) and `rows` rows; `cell` is asked twice for each
  // cell, row by row, so that nothing is kept but the widths. Texts are made visible here.
  using Cell = std::function<std::string(std::size_t row, std::size_t column)>;
  void write(Output& output, std::size_t rows, const Cell& cell);

 private:
  struct Column {
    std::string heading;
    Align align;
    std::size_t width;
  };
  std::size_t total_width() const;
  void shrink_columns();
  void append(std::string& line, std::size_t column, std::string_view text) const;
  std::vector<Column> columns_;
  std::size_t line_width_ = 0;  // 0: any
  bool is_cut_ = false;         // columns are left out
};

}  // namespace tool
