// What lists and tables share with the file that they belong to. Not for direct use.
#pragma once

#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <memory>
#include <string>
#include <string_view>

#include "../tevpf_access.h"
#include "error.hpp"

namespace tevpf {
inline namespace v1 {
// A name that something is looked up by, as it is handed in: any text. One that has its terminator
// behind it is not copied: a NameArg lives as long as the call that it is an argument of.
class NameArg {
 public:
  NameArg(const char* name) noexcept : text_(name), size_(std::strlen(name)) {}
  NameArg(const std::string& name) noexcept : text_(name.c_str()), size_(name.size()) {
    is_whole_ = std::memchr(text_, 0, size_) == nullptr;
  }
  NameArg(std::string_view name) noexcept : text_(copy_), size_(name.size()) {
    is_whole_ = size_ < sizeof copy_ && name.find('\0') == std::string_view::npos;
    const std::size_t copied = is_whole_ ? size_ : 0;
    if (copied > 0) std::memcpy(copy_, name.data(), copied);
    copy_[copied] = '\0';
    if (!is_whole_) text_ = name.data();
  }
  NameArg(const NameArg&) = delete;
  NameArg& operator=(const NameArg&) = delete;

  std::string_view view() const noexcept { return {text_, size_}; }
  // Ends with a terminator when the name is whole; it is not when nothing can have it.
  const char* c_str() const noexcept { return text_; }
  bool is_whole() const noexcept { return is_whole_; }
  // The C interface would read it as a pattern.
  bool is_pattern() const noexcept { return size_ > 0 && text_[size_ - 1] == '*'; }

 private:
  const char* text_;
  std::size_t size_;
  bool is_whole_ = true;
  char copy_[TEVPF_NAME_SIZE];
};

namespace detail {

// A path as the C interface takes it: in UTF-8 on Windows, where string() is in the system's code page,
// and the very bytes elsewhere.
inline std::string name_of(const std::filesystem::path& path) {
  const std::u8string name = path.u8string();
  return {name.begin(), name.end()};
}

// Counts changes that the C++ interface makes: of rows and their order, and of columns (or of which
// table a name means). What was read ahead, or is known of columns, is good while they stand still.
inline std::uint64_t row_changes = 0;
inline std::uint64_t layout_changes = 0;

// An open file, shared by the File and its lists and tables.
struct OpenFile {
  std::string name;    // as the library knows it
  const void* handle;  // tevpf_current_file() while the file is current; `this` once it is closed

  // Makes the file current. Free when it is.
  void select() const {
    if (tevpf_current_file() != handle) [[unlikely]] {
      change();
    }
  }

  bool is_open() const noexcept { return handle != this; }

  void close() noexcept {
    if (!is_open()) return;
    const bool is_known = TEV8R1_PF_change_file(name.c_str()) == PF_NORMAL;
    if (is_known && tevpf_current_file() == handle) TEV8R1_PF_close(0);
    handle = this;
    ++layout_changes;
    ++row_changes;
  }

 private:
  void change() const {
    if (!is_open()) throw Error(PF_NOFILE, name, {}, "'" + name + "' is not open any more");
    check(TEV8R1_PF_change_file(name.c_str()));
    if (tevpf_current_file() != handle) throw Error(PF_NOFILE, name, {});
  }
};

using OpenFilePtr = std::shared_ptr<const OpenFile>;

// A name of at most 19 characters, as the C interface takes it.
class Name {
 public:
  Name() noexcept { text_[0] = '\0'; }
  // A name that no element, parameter or column can have is not valid.
  explicit Name(std::string_view name) noexcept
      : is_valid_(name.size() < sizeof text_ && name.find('\0') == std::string_view::npos) {
    const std::size_t size = is_valid_ ? name.size() : 0;
    if (size > 0) std::memcpy(text_, name.data(), size);  // an empty view may have no address
    text_[size] = '\0';
  }

  const char* c_str() const noexcept { return text_; }
  std::string_view view() const noexcept { return text_; }
  bool is_valid() const noexcept { return is_valid_; }
  bool operator==(const Name& other) const noexcept { return view() == other.view(); }

 private:
  char text_[TEVPF_NAME_SIZE];
  bool is_valid_ = true;
};

// A name to be looked up: one that cannot exist is not found.
inline Name lookup_name(std::string_view name, TEVPF_STATUS not_found) {
  const Name result(name);
  if (!result.is_valid()) [[unlikely]] {
    throw Error(not_found, std::string(name), {});
  }
  return result;
}
inline Name lookup_element(std::string_view name, const char* kind) {
  const Name result(name);
  if (!result.is_valid()) throw Error(PF_NOELEM, kind, std::string(name));
  return result;
}

// A text for a field of `size` bytes, which the library would cut.
inline void check_text(std::string_view text, std::size_t size, TEVPF_STATUS status,
                       const char* what) {
  const bool has_nul = text.find('\0') != std::string_view::npos;
  if (text.size() < size && !has_nul) return;
  const std::string problem = has_nul ? " contains a NUL character"
                                      : " has " + std::to_string(text.size()) +
                                            " characters; at most " + std::to_string(size - 1) +
                                            " are possible";
  throw Error(status, std::string(text), what,
              std::string(what) + " '" + std::string(text) + "'" + problem);
}

// A name to be given.
inline Name new_name(std::string_view name) {
  check_text(name, TEVPF_NAME_SIZE, PF_BADNAME, "the name");
  return Name(name);
}

inline std::string element_description(std::string_view text) {
  check_text(text, TEVPF_DESC_SIZE, PF_BADARG, "the description");
  return std::string(text);
}

// A block that the C interface hands out.
struct FreeBlock {
  void operator()(void* block) const noexcept { std::free(block); }
};
template <class T>
using Block = std::unique_ptr<T[], FreeBlock>;

}  // namespace detail
}  // namespace v1
}  // namespace tevpf
