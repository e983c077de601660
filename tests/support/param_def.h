// Parameter definitions as values that tests can hold and compare.
#pragma once

#include <cstdlib>
#include <cstring>
#include <optional>
#include <ostream>
#include <string>
#include <vector>

#include "include/tevpf.h"
#include "values/value_type.h"

struct Def {
  std::int32_t type = PF_TYPE_INT;
  std::string name{}, units{};
  std::optional<std::string> description{};
  double value = 0, max = 100, min = -100;
  std::int32_t precision = 6;  // reals and doubles
  std::string text{};          // strings
  std::int32_t length = 0;     // strings: as handed in or as kept

  bool operator==(const Def&) const = default;
};

inline std::ostream& operator<<(std::ostream& out, const Def& def) {
  return out << def.name << " type " << def.type << " value " << def.value << " [" << def.min
             << ", " << def.max << "] precision " << def.precision << " text '" << def.text
             << "' length " << def.length << " units " << def.units << " description "
             << def.description.value_or("(none)");
}

// A definition for the interface; it points to the texts of `def`.
inline TEVPF_PARAM_DEF to_c(const Def& def) {
  TEVPF_PARAM_DEF c{};
  c.type = def.type;
  // Longer texts leave the fields without terminator.
  std::memcpy(c.name, def.name.data(), std::min(def.name.size(), sizeof c.name));
  std::memcpy(c.units, def.units.data(), std::min(def.units.size(), sizeof c.units));
  if (def.description) c.description = const_cast<char*>(def.description->c_str());
  if (def.type == PF_TYPE_STRING) {
    c.part.str = {def.length, const_cast<char*>(def.text.c_str())};
  } else {
    tevpf::with_number(def.type, [&](auto tag) {
      using T = decltype(tag);
      auto& part = tevpf::number_part<T>(c);
      part.value = static_cast<T>(def.value);
      part.max = static_cast<T>(def.max);
      part.min = static_cast<T>(def.min);
      if constexpr (tevpf::kIsFloating<T>) part.precision = def.precision;
    });
  }
  return c;
}

inline Def from_c(const TEVPF_PARAM_DEF& c) {
  Def def{c.type, c.name, c.units};
  def.precision = 0;
  if (c.description != nullptr) def.description = std::string(c.description);
  if (c.type == PF_TYPE_STRING) {
    def.max = def.min = 0;
    def.text = c.part.str.value;
    def.length = c.part.str.length;
  } else {
    tevpf::with_number(c.type, [&](auto tag) {
      using T = decltype(tag);
      const auto& part = tevpf::number_part<T>(c);
      def.value = static_cast<double>(part.value);
      def.max = static_cast<double>(part.max);
      def.min = static_cast<double>(part.min);
      if constexpr (tevpf::kIsFloating<T>) def.precision = part.precision;
    });
  }
  return def;
}

// What a list keeps of a definition: cut texts, a string's real length, nothing that its type lacks.
inline Def as_kept(Def def) {
  def.name = def.name.substr(0, 19);
  def.units = def.units.substr(0, 7);
  if (def.type == PF_TYPE_STRING) {
    def.value = def.max = def.min = 0;
    def.length = static_cast<std::int32_t>(def.text.size());
  } else {
    def.text.clear();
    def.length = 0;
  }
  if (!tevpf::is_floating_type(def.type)) def.precision = 0;
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
