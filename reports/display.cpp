#include "reports/display.h"

#include <algorithm>

namespace tevpf {

namespace {

// The number of characters of `rest` for this line: up to and including its last white space, if
// any.
std::size_t break_at(std::string_view rest, std::size_t most) noexcept {
  for (std::size_t k = most; k > 0; --k) {
    if (is_white(rest[k - 1]) && !is_white(rest[k])) return k;
  }
  return most;
}

}  // namespace

TEVPF_STATUS write_wrapped(TextOut& out, FirstLine first, std::int32_t width, std::string_view text,
                           std::string_view indent) noexcept {
  const std::size_t longest = static_cast<std::size_t>(std::max(width, 3));
  std::string_view lead = first == FirstLine::kGoesOn ? std::string_view() : indent;
  TEVPF_STATUS status = PF_NORMAL;
  while (text.size() > longest) {
    const std::size_t taken = break_at(text, longest - 2);
    out.print(lead, text.substr(0, taken), out.continuation(), '\n');
    text.remove_prefix(taken);
    lead = indent;
    status = PF_NOMORE;
  }
  out.print(lead, text);
  return status;
}

}  // namespace tevpf

TEVPF_STATUS TEV8R1_display_string_value(std::int32_t first, std::int32_t width, const char* text,
                                         std::FILE* stream, const char* indent) noexcept {
  using namespace tevpf;
  TextOut out(stream, TextOut::Size::kLine);
  return write_wrapped(out, first != 0 ? FirstLine::kGoesOn : FirstLine::kIndented, width, text,
                       indent);
}
