// The columns of a table, with where their values lie in a row.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string>
#include <string_view>
#include <vector>

#include "tevpf.hpp"

namespace sql {

struct Field {
  std::string name, sql_name;
  tevpf::Type type;
  std::int32_t offset, size;  // of the value in a row, in bytes
  bool is_indexed, is_unique;
  double tolerance;  // values that differ by no more are equal to the library; 0: exact

  bool is_text() const noexcept { return type == tevpf::Type::string; }

  // The value of a number; of a text the bytes without terminator.
  double number(const unsigned char* row) const noexcept;
  std::string_view text(const unsigned char* row) const noexcept {
    return reinterpret_cast<const char*>(row + offset);
  }
};

struct TableShape {
  explicit TableShape(const tevpf::Table& table);

  std::vector<Field> fields;
  std::size_t row_size;
};

template <class T>
T load(const unsigned char* place) noexcept {
  T value;
  std::memcpy(&value, place, sizeof value);
  return value;
}

inline double Field::number(const unsigned char* row) const noexcept {
  switch (type) {
    case tevpf::Type::int32:
      return load<std::int32_t>(row + offset);
    case tevpf::Type::int16:
      return load<std::int16_t>(row + offset);
    case tevpf::Type::float32:
      return static_cast<double>(load<float>(row + offset));
    default:
      return load<double>(row + offset);
  }
}

}  // namespace sql
