// The record of one parameter: its stored size, the place of its description, and the texts it
// owns.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>

#include "core/base/heap.h"
#include "lists/list.h"
#include "values/value_type.h"

extern "C" {

// Replaces the texts that the record points to with heap copies that it owns, and returns its
// stored size.
//   PF_NOMEM, PF_BADTYPE  the record is as it was
TEVPF_API TEVPF_STATUS TEV8R1_construct_param(TEVPF_PARAM* param, std::int32_t* bytes_out) noexcept;
}

namespace tevpf {

// Bytes of every stored parameter before its type part.
inline constexpr std::int32_t kParamHead = 44;

// Bytes of the type part, for a string without its text. Unknown codes count as integers.
constexpr std::int32_t part_size(std::int32_t type) noexcept {
  return value_type(is_value_type(type) ? type : PF_TYPE_INT).param_part;
}

// Bytes of the texts of a definition, terminators included; 0 for a missing text.
struct TextSizes {
  std::int64_t value;
  std::int64_t description;
};
TextSizes text_sizes(const TEVPF_PARAM_DEF& definition) noexcept;

// Bytes of a parameter in the file; 64 bits, so that no length overflows.
constexpr std::int64_t stored_size(std::int32_t type, const TextSizes& texts) noexcept {
  return kParamHead + part_size(type) + texts.value + texts.description;
}
std::int64_t stored_size(std::int32_t type, const char* description, std::int64_t length) noexcept;
std::int64_t stored_size(const TEVPF_PARAM_DEF& definition) noexcept;

// The desc_loc of a record with that definition.
inline std::int8_t description_place(const TEVPF_PARAM_DEF& definition) noexcept {
  constexpr std::int32_t kHeadBeforeDef = 8;  // desc_loc counts from its end
  if (definition.description == nullptr) return 0;
  if (definition.type == PF_TYPE_STRING) return 1;
  return static_cast<std::int8_t>(kParamHead + part_size(definition.type) - kHeadBeforeDef);
}

// Whether btf still fits in 31 bits after a change by `bytes`.
bool btf_can_change(const TEVPF_LIST& list, std::int64_t bytes) noexcept;

// Brings a copy of a caller's definition into the form that records hold: name and units
// terminated, a missing string value replaced by an empty text, length set from the value. The
// caller still owns the texts.
//   PF_NOMEM  the value is longer than 31 bits can say
[[nodiscard]] TEVPF_STATUS normalise(TEVPF_PARAM_DEF& definition) noexcept;

// Copies the value of a valid definition; strings with their terminator.
inline void copy_value(const TEVPF_PARAM_DEF& definition, void* value_out) noexcept {
  if (definition.type == PF_TYPE_STRING) {
    const auto length = static_cast<std::size_t>(definition.part.str.length);
    std::memcpy(value_out, definition.part.str.value, length + 1);
    return;
  }
  with_number(definition.type, [&](auto tag) {
    store<decltype(tag)>(value_out, number_part<decltype(tag)>(definition).value);
  });
}

// Releases the texts of a definition except those in `block`, and sets the pointers to null.
void release_texts(TEVPF_PARAM_DEF& definition, const TextBlock& block = {}) noexcept;

// Replaces the texts that the definition points to with heap copies that it owns; false when out of
// memory, and then the definition is unchanged.
[[nodiscard]] bool own_texts(TEVPF_PARAM_DEF& definition) noexcept;

// The same, with copies in the block that is being packed.
[[nodiscard]] inline bool own_texts(TEVPF_PARAM_DEF& definition, const TextSizes& sizes,
                                    TextPacker& packer, const TextBlock& block) noexcept {
  char* value = nullptr;
  if (definition.type == PF_TYPE_STRING) {
    value = packer.pack(definition.part.str.value, sizes.value);
    if (value == nullptr) return false;
  }
  if (definition.description != nullptr) {
    char* const description = packer.pack(definition.description, sizes.description);
    if (description == nullptr) {
      release_text(block, value);
      return false;
    }
    definition.description = description;
  }
  if (value != nullptr) definition.part.str.value = value;
  return true;
}

// A text about to enter a record. It overwrites the old text if that is large enough; otherwise a
// new block is allocated before anything changes.
class NewText {
 public:
  // `text`, of `length` characters, will replace a text with room for `capacity` bytes; null for no
  // text. False when out of memory.
  [[nodiscard]] bool prepare(const char* text, std::size_t length, std::size_t capacity) noexcept;

  // Overwrites the old text, or fills the new block and releases the old text unless it lies in the
  // list's text block. Returns the text now in place, null for no text.
  char* commit(char* old, const TextBlock& block) noexcept;

 private:
  const char* text_ = nullptr;
  std::size_t length_ = 0;
  Owned<char> block_;
};

}  // namespace tevpf
