// A value as the error context shows it: numbers as "%d" or "%g", texts as they are.
#pragma once

#include "core/base/status.h"
#include "values/value_type.h"

namespace tevpf {

template <class T>
Text number_text(T value) noexcept {
  if constexpr (kIsFloating<T>) {
    return Text(static_cast<double>(value));
  } else {
    return Text(std::int32_t{value});
  }
}

// The text of a value, given its type code. Points to a string value, which must outlive this
// object.
class ValueText {
 public:
  ValueText(std::int32_t type, const void* value) noexcept
      : number_(type == PF_TYPE_STRING ? Text(std::int32_t{0}) : text_of_number(type, value)),
        text_(type == PF_TYPE_STRING ? static_cast<const char*>(value) : nullptr) {}

  const char* c_str() const noexcept { return text_ != nullptr ? text_ : number_.c_str(); }

 private:
  static Text text_of_number(std::int32_t type, const void* value) noexcept {
    return with_number(type, [&](auto tag) { return number_text(load<decltype(tag)>(value)); });
  }

  Text number_;
  const char* text_;
};

}  // namespace tevpf
