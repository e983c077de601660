// One parameter as a record: its stored size, the place of its description, and the texts it owns.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>

#include "core/base/heap.h"
#include "lists/list.h"
#include "values/value_type.h"

extern "C" {

// Replaces the texts that the record points to by heap copies of its own, and gives its stored
// size.
//   PF_NOMEM, PF_BADTYPE  the record is as it was
TEVPF_API TEVPF_STATUS TEV8R1_construct_param(TEVPF_PARAM* param, std::int32_t* bytes_out) noexcept;
}

namespace tevpf {

// What every parameter takes in the file before its type part.
inline constexpr std::int32_t kParamHead = 44;

// Bytes of the type part, of a string without its text; codes that are none count as integers.
constexpr std::int32_t part_size(std::int32_t type) noexcept {
  return value_type(is_value_type(type) ? type : PF_TYPE_INT).param_part;
}

// The bytes that the texts of a definition take, terminators counted; 0 where there is no text.
struct TextSizes {
  std::int64_t value;
  std::int64_t description;
};
TextSizes text_sizes(const TEVPF_PARAM_DEF& definition) noexcept;

// Bytes of a parameter in the file, in 64 bits so that no text is too long to be measured.
constexpr std::int64_t stored_size(std::int32_t type, const TextSizes& texts) noexcept {
  return kParamHead + part_size(type) + texts.value + texts.description;
}
std::int64_t stored_size(std::int32_t type, const char* description, std::int64_t length) noexcept;
std::int64_t stored_size(const TEVPF_PARAM_DEF& definition) noexcept;

// The desc_loc of a record with that definition.
inline std::int8_t description_place(const TEVPF_PARAM_DEF& definition) noexcept {
  constexpr std::int32_t kHeadBeforeDef = 8;  // desc_loc counts from behind it
  if (definition.description == nullptr) return 0;
  if (definition.type == PF_TYPE_STRING) return 1;
  return static_cast<std::int8_t>(kParamHead + part_size(definition.type) - kHeadBeforeDef);
}

// Whether btf can change by that many bytes and still fit its 31 bits.
bool btf_can_change(const TEVPF_LIST& list, std::int64_t bytes) noexcept;

// A copy of a caller's definition as records hold them: name and units terminated, the absent
// string value an empty text, length that of the value. The texts still are the caller's.
//   PF_NOMEM  the value is longer than 31 bits can say
[[nodiscard]] TEVPF_STATUS normalise(TEVPF_PARAM_DEF& definition) noexcept;

// Copies the value of a definition that is in order, strings with their terminator.
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

// Releases the texts of a definition but those in that block, and leaves null pointers.
void release_texts(TEVPF_PARAM_DEF& definition, const TextBlock& block = {}) noexcept;

// Replaces the texts that the definition points to by heap copies; false when memory runs out, and
// then the definition is as it was.
[[nodiscard]] bool own_texts(TEVPF_PARAM_DEF& definition) noexcept;

// The same with copies in the block that is being packed.
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

// A text on its way into a record: it goes to the place of the old one when that is large enough,
// else a new block is there before anything changes.
class NewText {
 public:
  // `text`, of `length` characters, is to replace what stands in a place of `capacity` bytes; null
  // for no text. false when memory runs out.
  [[nodiscard]] bool prepare(const char* text, std::size_t length, std::size_t capacity) noexcept;

  // Writes it over the old text, or into the new block and releases the old one, unless the list's
  // text block holds that. Gives what stands there now, null for no text.
  char* commit(char* old, const TextBlock& block) noexcept;

 private:
  const char* text_ = nullptr;
  std::size_t length_ = 0;
  Owned<char> block_;
};

}  // namespace tevpf
