// Values of SQL and of parameter files as each other. What is not a number is NULL.
#pragma once

#include <string>
#include <string_view>

#include "sqlite.h"
#include "tevpf.hpp"

namespace sql {

// As SQLite itself would store the value in a column of such numbers or texts: "12" becomes 12, 12
// becomes "12". NULL is the empty text. A text is not copied: the Cell lives as long as the value.
//   kind, name  what it is for: "column" and its name
// Throws tevpf::Error for NULL in place of an integer.
tevpf::Cell to_cell(sqlite3_value* value, tevpf::Type type, const char* kind,
                    const std::string& name);

// A text as it is, NULL as the empty one.
std::string_view text_of(sqlite3_value* value);

inline void deliver(sqlite3_context* context, double number) {
  sqlite3_result_double(context, number);  // NULL for what is not a number
}
// A text that ends with a terminator. SQLite reallocates one that does not when a function reads it,
// in every row.
inline void deliver(sqlite3_context* context, const char* text) {
  sqlite3_result_text(context, text, -1, SQLITE_TRANSIENT);
}
inline void deliver(sqlite3_context* context, std::string_view text) {
  sqlite3_result_text64(context, text.data(), text.size(), SQLITE_TRANSIENT, SQLITE_UTF8);
}
void deliver(sqlite3_context* context, const tevpf::Value& value);

// "name", with quotes in it doubled.
std::string identifier(std::string_view name);

// The bytes of a name that are no UTF-8 as \xNN, so that every client can read it.
std::string utf8(std::string_view name);

}  // namespace sql
