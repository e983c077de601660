// The definition of a parameter, with its value.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <utility>

#include "definition.hpp"

namespace tevpf {
inline namespace v1 {

//   engine.add(tevpf::Parameter("Thrust", 480.0).units("kN").bounds(0, 800).precision(5));
class Parameter : public Definition<Parameter> {
 public:
  // The type is that of the value: int32_t, int16_t, float, double or text.
  // PF_BADNAME: more than 19 characters, a blank at the front.
  Parameter(std::string_view name, Value value)
      : Definition(name, type_of_value(value)), value_(std::move(value)) {}

  const Value& value() const noexcept { return value_; }

  // The value as a T. std::bad_variant_access when it is of another type.
  template <Readable T>
  T get() const {
    if constexpr (Number<T>) {
      return std::get<T>(value_);
    } else {
      return std::get<std::string>(value_);
    }
  }

  // Another value of the same type. PF_BADTYPE, PF_RANGE (beyond the type's range).
  Parameter& value(const Cell& cell) {
    value_ = detail::to_value(type(), cell, {kind, name()});
    return *this;
  }

  bool operator==(const Parameter&) const = default;

 private:
  friend class Definition<Parameter>;
  friend class List;
  static constexpr const char* kind = "parameter";

  Parameter() = default;

  // The parameter at a position of a list in the current file; texts are reused.
  void load(const char* list, std::int32_t position);
  void load_part(const TEVPF_PARAM_DEF& def);
  TEVPF_PARAM_DEF definition() const;

  Value value_;
};

// ---- Implementation -----------------------------------------------------------------------------

inline void Parameter::load(const char* list, std::int32_t position) {
  std::int32_t type = 0;
  std::int32_t value_size = 0;
  std::int32_t description_size = 0;
  detail::check(
      TEV8R1_PF_inq_param_size_by_pos(list, position, &type, &value_size, &description_size));

  TEVPF_PARAM_DEF def;
  std::string& description = description_buffer(static_cast<std::size_t>(description_size));
  def.description = description.data();
  std::string* text = nullptr;
  if (type == PF_TYPE_STRING) {
    text = std::get_if<std::string>(&value_);
    if (text == nullptr) text = &value_.emplace<std::string>();
    text->resize(static_cast<std::size_t>(value_size));
    def.part.str.value = text->data();
  }
  detail::check(TEV8R1_PF_get_param_def_by_pos(list, position, &def));
  description.pop_back();  // the terminators
  if (text != nullptr) text->pop_back();
  load_texts(def);
  load_part(def);
}

// The fields of the record may be unaligned: they are copied by value only.
inline void Parameter::load_part(const TEVPF_PARAM_DEF& def) {
  switch (def.type) {
    case PF_TYPE_INT:
      value_.emplace<std::int32_t>(std::int32_t{def.part.i32.value});
      return load_bounds(std::int32_t{def.part.i32.min}, std::int32_t{def.part.i32.max});
    case PF_TYPE_SHORT:
      value_.emplace<std::int16_t>(std::int16_t{def.part.i16.value});
      return load_bounds(std::int16_t{def.part.i16.min}, std::int16_t{def.part.i16.max});
    case PF_TYPE_REAL:
      value_.emplace<float>(float{def.part.f32.value});
      return load_bounds(float{def.part.f32.min}, float{def.part.f32.max}, def.part.f32.precision);
    case PF_TYPE_DOUBLE:
      value_.emplace<double>(double{def.part.f64.value});
      return load_bounds(double{def.part.f64.min}, double{def.part.f64.max},
                         def.part.f64.precision);
    default:
      return load_no_bounds();
  }
}

inline TEVPF_PARAM_DEF Parameter::definition() const {
  TEVPF_PARAM_DEF def{};
  store_texts(def);
  detail::with_type(type(), [&](auto tag) {
    using T = typename decltype(tag)::type;
    if constexpr (std::same_as<T, std::int32_t>) {
      def.part.i32 = {std::get<T>(value_), stored_max<T>(), stored_min<T>()};
    } else if constexpr (std::same_as<T, std::int16_t>) {
      def.part.i16 = {std::get<T>(value_), stored_max<T>(), stored_min<T>()};
    } else if constexpr (std::same_as<T, float>) {
      def.part.f32 = {precision(), std::get<T>(value_), stored_max<T>(), stored_min<T>()};
    } else if constexpr (std::same_as<T, double>) {
      def.part.f64 = {precision(), std::get<T>(value_), stored_max<T>(), stored_min<T>()};
    } else {
      def.part.str.value = const_cast<char*>(std::get<T>(value_).c_str());
    }
  });
  return def;
}

}  // namespace v1
}  // namespace tevpf
