// A value as the error context shows it: numbers as "%d" or "%g", texts as they are.
#pragma once

#include "core/status.h"
#include "values/value_type.h"

namespace tevpf {

// Points to a text value, which must outlive it.
class ValueText {
 public:
  ValueText(std::int32_t type, const void* value) noexcept
      : number_(type == PF_TYPE_STRING ? Text(std::int32_t{0}) : number_text(type, value)),
        text_(type == PF_TYPE_STRING ? static_cast<const char*>(value) : nullptr) {}

  const char* c_str() const noexcept { return text_ != nullptr ? text_ : number_.c_str(); }

 private:
  static Text number_text(std::int32_t type, const void* value) noexcept {
    return with_number(type, [&](auto tag) {
      using T = decltype(tag);
      if constexpr (kIsFloating<T>) {
        return Text(static_cast<double>(load<T>(value)));
      } else {
        return Text(static_cast<std::int32_t>(load<T>(value)));
      }
    });
  }

  Text number_;
  const char* text_;
};

}  // namespace tevpf
