// The error context as tests see it: set to known texts before a call, compared after it.
#pragma once

#include <gtest/gtest.h>

#include <cstdio>
#include <string>

#include "core/base/error_context.h"
#include "include/tevpf.h"

struct ErrorTexts {
  std::string item, value;
  bool operator==(const ErrorTexts&) const = default;
};

inline const ErrorTexts kUntouched{"previous item", "previous value"};
inline const ErrorTexts kEmpty{};

inline void set_error_texts(const ErrorTexts& texts = kUntouched) {
  std::snprintf(tevpf::err_item, sizeof tevpf::err_item, "%s", texts.item.c_str());
  std::snprintf(tevpf::err_value, sizeof tevpf::err_value, "%s", texts.value.c_str());
}

inline ErrorTexts error_texts() { return {tevpf::err_item, tevpf::err_value}; }

inline std::ostream& operator<<(std::ostream& out, const ErrorTexts& texts) {
  return out << '"' << texts.item << "\", \"" << texts.value << '"';
}

// What a call answered and what it left in the error context, which is then ready for the next one.
inline void expect_answer(TEVPF_STATUS got, TEVPF_STATUS status,
                          const ErrorTexts& texts = kUntouched, const char* file = __builtin_FILE(),
                          int line = __builtin_LINE()) {
  const testing::ScopedTrace trace(file, line, "the call");
  EXPECT_EQ(got, status);
  EXPECT_EQ(error_texts(), texts);
  set_error_texts();
}
