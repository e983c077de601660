// How operations fail: with one status and two short texts that say what failed and where.
//
// Three ways, each visible where it happens:
//   return fail(PF_BADPOS, Text(pos), Text(count));   writes both texts
//   return fail_empty(PF_NOMEM);                      empties both
//   return PF_SEARCHSET;                              leaves both as they were
#pragma once

#include <cstdint>

#include "include/tevpf.h"

namespace tevpf {

// A number as text, formatted with "%d" or "%g", in its own buffer.
class Text {
 public:
  explicit Text(std::int32_t number) noexcept;
  explicit Text(double number) noexcept;
  const char* c_str() const noexcept { return buffer_; }

 private:
  char buffer_[32];
};

// The content of one of the two texts: a fixed word followed by its subject.
struct Phrase {
  Phrase(const char* whole) noexcept : lead(whole), rest("") {}
  Phrase(const char* word, const char* subject) noexcept : lead(word), rest(subject) {}
  Phrase(const Text& number) noexcept : lead(number.c_str()), rest("") {}

  const char* lead;
  const char* rest;
};

// Writes both texts, truncated to their sizes, and returns the status.
[[nodiscard]] TEVPF_STATUS fail(TEVPF_STATUS status, Phrase item, Phrase value = "") noexcept;

// Empties both texts and returns the status.
[[nodiscard]] TEVPF_STATUS fail_empty(TEVPF_STATUS status) noexcept;

// Writes only the first text and returns the status; the second text is unchanged.
[[nodiscard]] TEVPF_STATUS fail_item(TEVPF_STATUS status, Phrase item) noexcept;

void clear_error_context() noexcept;

}  // namespace tevpf

// Returns a failure to the caller unchanged.
#define PF_TRY(expr)                                                               \
  do {                                                                             \
    if (const TEVPF_STATUS pf_try_ = (expr); pf_try_ != PF_NORMAL) return pf_try_; \
  } while (0)
