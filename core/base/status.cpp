// The error context and the three ways to fail. Nothing else writes the two texts.
#include "core/base/status.h"

#include <cstddef>

#include "core/base/error_context.h"
#include "core/base/number_text.h"

namespace tevpf {

char err_item[kItemSize] = "";
char err_value[kValueSize] = "";

namespace {

template <std::size_t N>
char* append(char (&text)[N], char* end, const char* part) noexcept {
  while (*part != '\0' && end != text + N - 1) *end++ = *part++;
  return end;
}

template <std::size_t N>
void write(char (&text)[N], const Phrase& phrase) noexcept {
  char* end = append(text, text, phrase.lead);
  end = append(text, end, phrase.rest);
  *end = '\0';
}

}  // namespace

Text::Text(std::int32_t number) noexcept { *write_decimal(buffer_, number) = '\0'; }

Text::Text(double number) noexcept { *write_general(buffer_, number, kDefaultPrecision) = '\0'; }

TEVPF_STATUS fail(TEVPF_STATUS status, Phrase item, Phrase value) noexcept {
  write(err_item, item);
  write(err_value, value);
  return status;
}

TEVPF_STATUS fail_empty(TEVPF_STATUS status) noexcept {
  clear_error_context();
  return status;
}

TEVPF_STATUS fail_item(TEVPF_STATUS status, Phrase item) noexcept {
  write(err_item, item);
  return status;
}

void clear_error_context() noexcept {
  err_item[0] = '\0';
  err_value[0] = '\0';
}

}  // namespace tevpf
