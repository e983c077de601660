// Failures of the C++ interface.
#pragma once

#include <memory>
#include <new>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>

#include "../tevpf_message.h"

namespace tevpf {
inline namespace v1 {

// What every refused or failed operation throws, memory aside: that is std::bad_alloc. what() is one
// English sentence without capital and full stop, such as "'Thrust': 900 is out of range".
class Error : public std::runtime_error {
 public:
  // The sentence is the one that tevpf_message_of makes of the status and the texts.
  Error(TEVPF_STATUS status, std::string item, std::string value)
      : Error(status, item, value, sentence(status, item, value)) {}
  Error(TEVPF_STATUS status, std::string item, std::string value, const std::string& sentence)
      : std::runtime_error(sentence),
        status_(status),
        texts_(std::make_shared<const Texts>(Texts{std::move(item), std::move(value)})) {}

  TEVPF_STATUS status() const noexcept { return status_; }

  // The two texts of the failure: what failed, and where or which limit. Often empty.
  const std::string& item() const noexcept { return texts_->item; }
  const std::string& value() const noexcept { return texts_->value; }

 private:
  struct Texts {
    std::string item, value;
  };

  static std::string sentence(TEVPF_STATUS status, const std::string& item,
                              const std::string& value) {
    std::string text(tevpf_message_of(status, item.c_str(), value.c_str(), nullptr, 0), '\0');
    tevpf_message_of(status, item.c_str(), value.c_str(), text.data(), text.size() + 1);
    return text;
  }

  TEVPF_STATUS status_;
  std::shared_ptr<const Texts> texts_;  // shared, so that copying an Error cannot fail
};

namespace detail {

// Throws the failure that a C operation has just reported. Where the library does not say which
// parameter or column a value was meant for, `subject` does.
[[noreturn]] inline void raise(TEVPF_STATUS status, std::string_view subject = {}) {
  if (status == PF_NOMEM) throw std::bad_alloc();
  std::string value = tevpf_error_value();
  if (status == PF_RANGE && value.empty()) value = subject;
  throw Error(status, tevpf_error_item(), std::move(value));
}

inline void check(TEVPF_STATUS status) {
  if (status != PF_NORMAL) [[unlikely]] {
    raise(status);
  }
}

}  // namespace detail
}  // namespace v1
}  // namespace tevpf
