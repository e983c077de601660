#include "values/text_compare.h"

#include "include/tevpf.h"

TEVPF_STATUS TEV8R1_string_compare(const char* text, const char* pattern) noexcept {
  const int order = tevpf::compare_text(text, tevpf::make_pattern(pattern));
  if (order == 0) return PF_NORMAL;
  return order < 0 ? static_cast<TEVPF_STATUS>(-1) : 1;
}
