// Parameter definitions as values that tests can hold and compare.
#pragma once

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <optional>
#include <string>
#include <vector>

#include "support/definitions.h"

struct Def {
  std::int32_t type = PF_TYPE_INT;
  std::string name{}, units{};
  std::optional<std::string> description{};
  double value = 0, max = 100, min = -100;
  std::int32_t precision = 6;  // reals and doubles
  std::string text{};          // strings
  std::int32_t length = 0;  // strings: as handed in or as kept; negative: no text, if it is empty
};

// A definition for the interface; it points to the texts of `def`.
inline TEVPF_PARAM_DEF to_c(const Def& def) {
  TEVPF_PARAM_DEF c{};
  c.type = def.type;
  // Longer texts leave the fields without terminator.
  std::memcpy(c.name, def.name.data(), std::min(def.name.size(), sizeof c.name));
  std::memcpy(c.units, def.units.data(), std::min(def.units.size(), sizeof c.units));
  if (def.description) c.description = const_cast<char*>(def.description->c_str());
  if (def.type == PF_TYPE_STRING) {
    const bool absent = def.text.empty() && def.length < 0;
    c.part.str = {def.length, absent ? nullptr : const_cast<char*>(def.text.c_str())};
  } else if (tevpf::is_number_type(def.type)) {
    tevpf::with_number(def.type, [&](auto tag) {
      using T = decltype(tag);
      tevpf::put_numbers<T>(tevpf::number_part<T>(c), {def.min, def.max, def.precision}, def.value);
    });
  }
  return c;
}

// All that a definition says, to be compared; an absent description differs from an empty one.
inline std::string text_of(const TEVPF_PARAM_DEF& c) {
  char part[200] = "";
  if (c.type == PF_TYPE_STRING) {
    std::snprintf(part, sizeof part, "'%s' of length %d",
                  c.part.str.value == nullptr ? "" : c.part.str.value, c.part.str.length);
  } else {
    tevpf::with_number(c.type, [&](auto tag) {
      const auto& number = tevpf::number_part<decltype(tag)>(c);
      int precision = 0;
      if constexpr (tevpf::kIsFloating<decltype(tag)>) precision = number.precision;
      std::snprintf(part, sizeof part, "%a in [%a, %a], precision %d", double(number.value),
                    double(number.min), double(number.max), precision);
    });
  }
  return std::string(c.name) + ": type " + std::to_string(c.type) + ", " + part + ", units " +
         c.units + (c.description == nullptr ? "" : ", description " + std::string(c.description));
}
inline std::string text_of(const Def& def) { return text_of(to_c(def)); }

// What a list keeps of a definition: cut texts, a string's real length.
inline Def as_kept(Def def) {
  def.name = def.name.substr(0, 19);
  def.units = def.units.substr(0, 7);
  def.length = static_cast<std::int32_t>(def.text.size());
  return def;
}

// A record with buffers of exactly the given sizes, for the operations that deliver definitions.
struct DefBuffers {
  DefBuffers(std::int32_t value_size, std::int32_t desc_size)
      : value(static_cast<std::size_t>(value_size), '?'),
        description(static_cast<std::size_t>(desc_size), '?') {
    c.description = description.data();
    c.part.str.value = value.data();
  }

  std::vector<char> value, description;
  TEVPF_PARAM_DEF c{};
};
