#include "core/io/body.h"

namespace tevpf {

const unsigned char* Body::take_fields(std::int32_t count) noexcept {
  while (at_hand().left() < count) {
    if (fetch_more() != Input::Got::kAll) return nullptr;
  }
  const unsigned char* const fields = at_hand().take(count);
  take(count);
  return fields;
}

bool Body::take_rest() noexcept {
  do {
    take(at_hand().left());
  } while (left_ != 0 && fetch_more() == Input::Got::kAll);
  return left_ == 0;
}

Input::Got Body::fetch_more() noexcept {
  if (at_hand().left() == left_) return Input::Got::kPart;
  return input_->fetch_more(left_);
}

}  // namespace tevpf
