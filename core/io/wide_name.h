// For Windows alone. File names: UTF-8 in the library, UTF-16 in the system.
#pragma once

namespace tevpf {

// The UTF-16 form of a name.
class WideName {
 public:
  explicit WideName(const char* name) noexcept;

  // Null, with errno set, if the name is not UTF-8 or is too long for any file.
  [[nodiscard]] const wchar_t* get() const noexcept { return is_valid_ ? text_ : nullptr; }

 private:
  static constexpr int kSize = 4096;
  wchar_t text_[kSize];
  bool is_valid_;
};

}  // namespace tevpf
