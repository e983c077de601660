// Lists and tables of the open file, copied out of the library into plain records.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "pf_file.h"
#include "tevpf.h"
#include "values.h"

namespace tool {

struct Bounds {
  Value min, max;
};

struct Parameter {
  std::string name, units, description;
  std::int32_t type = 0;
  Value value;
  std::optional<Bounds> bounds;  // numbers only
  std::int32_t precision = 0;    // floating types only
};

struct Column {
  std::string name, units, description;
  std::int32_t type = 0, width = 0, offset = 0;
  std::optional<Bounds> bounds;
  std::int32_t precision = 0;
  bool indexed = false, unique = false;
};

std::vector<Parameter> read_list(const PfFile& file, const std::string& name);

// The parameter of exactly that name, or a Failure: a trailing "*" is no pattern here.
Parameter find_parameter(const PfFile& file, const std::string& list, const std::string& name);

class Table {
 public:
  Table(const PfFile& file, const std::string& name);

  const std::vector<Column>& columns() const { return columns_; }
  std::size_t row_count() const { return row_count_; }
  std::size_t row_size() const { return row_size_; }
  const std::string& name() const { return name_; }

  // The column of that name, or a Failure that lists the columns there are.
  std::size_t column_position(const std::string& name) const;

  // Reads one row, in storage order from 0; cell() then gives its values.
  void read_row(std::size_t number);
  Value cell(std::size_t column) const;

 private:
  std::string file_, name_;
  std::vector<Column> columns_;
  std::size_t row_count_ = 0, row_size_ = 0;
  std::vector<char> row_;  // empty until a row is read: a table without rows can be of any width
};

// "from 0 to 3000 rpm"; empty when the bounds only say what the type can hold.
std::string bounds_text(const std::optional<Bounds>& bounds, const std::string& units);

// A sentence's end about a text that is no value of the type, or lies outside the bounds.
std::string refused_value(const std::string& text, std::int32_t type, Parsed parsed,
                          const std::optional<Bounds>& bounds, const std::string& units);

}  // namespace tool
