#include "lists/param_record.h"

#include <cstring>
#include <limits>

#include "core/base/status.h"
#include "core/base/text_field.h"
#include "values/value_type.h"

namespace tevpf {
namespace {

constexpr std::int32_t kMaxInt = std::numeric_limits<std::int32_t>::max();

std::int64_t text_size(const char* text) noexcept {
  return text == nullptr ? 0 : static_cast<std::int64_t>(std::strlen(text)) + 1;
}

}  // namespace

std::int64_t stored_size(std::int32_t type, const char* description, std::int64_t length) noexcept {
  return stored_size(type, {type == PF_TYPE_STRING ? length + 1 : 0, text_size(description)});
}

std::int64_t stored_size(const TEVPF_PARAM_DEF& definition) noexcept {
  const bool string = definition.type == PF_TYPE_STRING;
  return stored_size(definition.type, definition.description,
                     string ? definition.part.str.length : 0);
}

bool btf_can_change(const TEVPF_LIST& list, std::int64_t bytes) noexcept {
  return list.header.btf + bytes <= kMaxInt;
}

TEVPF_STATUS normalise(TEVPF_PARAM_DEF& definition) noexcept {
  terminate_field(definition.name);
  terminate_field(definition.units);
  if (definition.type != PF_TYPE_STRING) return PF_NORMAL;

  static char empty[] = "";
  auto& string = definition.part.str;
  if (string.value == nullptr) string.value = empty;
  const std::size_t length = std::strlen(string.value);
  if (length >= static_cast<std::size_t>(kMaxInt)) return fail_empty(PF_NOMEM);
  string.length = static_cast<std::int32_t>(length);
  return PF_NORMAL;
}

void release_texts(TEVPF_PARAM_DEF& definition, const TextBlock& block) noexcept {
  release_text(block, definition.description);
  definition.description = nullptr;
  if (definition.type != PF_TYPE_STRING) return;
  release_text(block, definition.part.str.value);
  definition.part.str.value = nullptr;
}

TextSizes text_sizes(const TEVPF_PARAM_DEF& definition) noexcept {
  const bool string = definition.type == PF_TYPE_STRING;
  return {string ? text_size(definition.part.str.value) : 0, text_size(definition.description)};
}

bool own_texts(TEVPF_PARAM_DEF& definition) noexcept {
  TextPacker none;  // each text gets its own block
  return own_texts(definition, text_sizes(definition), none, {});
}

bool NewText::prepare(const char* text, std::size_t length, std::size_t capacity) noexcept {
  text_ = text;
  length_ = length;
  if (text == nullptr || length < capacity) return true;
  block_ = new_array<char>(std::uint64_t{length} + 1);
  return block_ != nullptr;
}

char* NewText::commit(char* old, const TextBlock& block) noexcept {
  if (text_ != nullptr && !block_) {
    std::memmove(old, text_, length_ + 1);
    return old;
  }
  if (block_) std::memcpy(block_.get(), text_, length_ + 1);
  release_text(block, old);
  return block_.release();
}

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_calc_param_bytes(std::int32_t type, const char* description,
                                     std::int32_t length, std::int32_t* bytes_out) noexcept {
  if (!is_value_type(type)) return fail(PF_BADTYPE, "parameter", Text(type));
  const std::int64_t bytes = stored_size(type, description, length);
  if (bytes > kMaxInt) return fail_empty(PF_NOMEM);
  *bytes_out = static_cast<std::int32_t>(bytes);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_adjust_param_size_btf(std::int32_t old_type, std::int32_t new_type,
                                          std::int32_t* btf) noexcept {
  *btf += part_size(new_type) - part_size(old_type);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_construct_param(TEVPF_PARAM* param, std::int32_t* bytes_out) noexcept {
  const TEVPF_PARAM_DEF& definition = param->def;
  const std::int32_t length = definition.type == PF_TYPE_STRING ? definition.part.str.length : 0;
  PF_TRY(TEV8R1_calc_param_bytes(definition.type, definition.description, length, bytes_out));
  return own_texts(param->def) ? TEVPF_STATUS{PF_NORMAL} : fail_empty(PF_NOMEM);
}
