#include "values/compare.h"

#include "core/base/status.h"

using namespace tevpf;

namespace {

TEVPF_STATUS comparison_answer(int answer) noexcept {
  if (answer == 0) return PF_NORMAL;
  return answer < 0 ? static_cast<TEVPF_STATUS>(-1) : TEVPF_STATUS{1};
}

}  // namespace

TEVPF_STATUS TEV8R1_string_compare(const char* text, const char* pattern) noexcept {
  return comparison_answer(compare_text(text, make_pattern(pattern)));
}

TEVPF_STATUS TEV8R1_compare(int32_t type, const void* a, const void* b, double tolerance) noexcept {
  if (!is_value_type(type)) return fail(PF_BADTYPE, "value", Text(type));
  if (type == PF_TYPE_STRING) {
    return TEV8R1_string_compare(static_cast<const char*>(a), static_cast<const char*>(b));
  }
  return with_number(type, [&](auto tag) {
    using T = decltype(tag);
    return comparison_answer(compare_numbers(load<T>(a), load<T>(b), tolerance));
  });
}
