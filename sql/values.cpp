#include "values.h"

#include <cmath>
#include <limits>

#include "utf8.h"

namespace sql {
namespace {

std::string_view bytes_of(sqlite3_value* value) {
  const auto* const bytes = static_cast<const char*>(sqlite3_value_blob(value));
  return {bytes == nullptr ? "" : bytes, static_cast<std::size_t>(sqlite3_value_bytes(value))};
}

// An integer that was written as a fraction, such as 3.0, is one.
tevpf::Cell number_cell(double number, tevpf::Type type) {
  constexpr double kLimit = 9007199254740992.0;  // all integers below it are exact
  const bool is_integer = type == tevpf::Type::int32 || type == tevpf::Type::int16;
  if (is_integer && std::trunc(number) == number && std::abs(number) < kLimit) {
    return static_cast<std::int64_t>(number);
  }
  return number;
}

}  // namespace

tevpf::Cell to_cell(sqlite3_value* value, tevpf::Type type, const char* kind,
                    const std::string& name) {
  const bool is_text = type == tevpf::Type::string;
  const bool is_floating = type == tevpf::Type::float32 || type == tevpf::Type::float64;
  switch (is_text ? sqlite3_value_type(value) : sqlite3_value_numeric_type(value)) {
    case SQLITE_NULL:
      if (is_floating) return std::numeric_limits<double>::quiet_NaN();
      if (is_text) break;
      throw tevpf::Error(PF_BADTYPE, kind + (" " + name), tevpf::to_string(type),
                         "'" + name + "': NULL is no integer");
    case SQLITE_INTEGER:
      if (!is_text) return static_cast<std::int64_t>(sqlite3_value_int64(value));
      break;
    case SQLITE_FLOAT:
      if (!is_text) return number_cell(sqlite3_value_double(value), type);
      break;
    case SQLITE_BLOB:
      return bytes_of(value);
    default:
      break;
  }
  return text_of(value);
}

std::string_view text_of(sqlite3_value* value) {
  const auto* const text = reinterpret_cast<const char*>(sqlite3_value_text(value));
  if (text == nullptr) {
    if (sqlite3_value_type(value) != SQLITE_NULL) throw std::bad_alloc();
    return "";
  }
  return {text, static_cast<std::size_t>(sqlite3_value_bytes(value))};
}

void deliver(sqlite3_context* context, const tevpf::Value& value) {
  std::visit(
      [context](const auto& v) {
        using T = std::decay_t<decltype(v)>;
        if constexpr (std::is_integral_v<T>) {
          sqlite3_result_int(context, v);
        } else if constexpr (std::is_floating_point_v<T>) {
          deliver(context, static_cast<double>(v));
        } else {
          deliver(context, std::string_view(v));
        }
      },
      value);
}

std::string identifier(std::string_view name) {
  std::string result = "\"";
  for (const char c : name) {
    if (c == '"') result += '"';
    result += c;
  }
  return result + '"';
}

std::string utf8(std::string_view name) {
  static constexpr std::string_view kDigits = "0123456789abcdef";
  std::string result;
  while (!name.empty()) {
    const std::size_t size = character_size(name);
    if (size > 0) {
      result += name.substr(0, size);
    } else {
      const auto byte = static_cast<unsigned char>(name[0]);
      result += {'\\', 'x', kDigits[byte >> 4U], kDigits[byte & 0xFU]};
    }
    name.remove_prefix(size > 0 ? size : 1);
  }
  return result;
}

}  // namespace sql
