// The definition of a column.
#pragma once

#include <cstdint>
#include <limits>
#include <string>
#include <string_view>

#include "definition.hpp"

namespace tevpf {
inline namespace v1 {

//   table.add_column(tevpf::Column("number", tevpf::Type::int16).unique());
//   table.add_column(tevpf::Column("symbol", tevpf::Type::string).width(3).indexed());
class Column : public Definition<Column> {
 public:
  // PF_BADNAME: more than 19 characters, a blank at the front.
  Column(std::string_view name, Type type) : Definition(name, type), width_(default_width(type)) {}

  // Display width in characters; of strings also the largest length of a text, 1 at first.
  std::int32_t width() const noexcept { return width_; }
  bool is_indexed() const noexcept { return is_indexed_; }
  bool is_unique() const noexcept { return is_unique_; }  // and then indexed

  Column& width(std::int32_t characters) {  // PF_BADWIDTH: below 1
    if (characters < 1) throw Error(PF_BADWIDTH, std::to_string(characters), name());
    width_ = characters;
    return *this;
  }
  // An index serves searches and orders rows; without it a column is not unique either.
  Column& indexed(bool on = true) noexcept {
    is_indexed_ = on;
    is_unique_ = is_unique_ && on;
    return *this;
  }
  // No two rows hold the same value (reals and doubles: within 10^-(precision + 1)).
  Column& unique(bool on = true) noexcept {
    is_unique_ = on;
    is_indexed_ = is_indexed_ || on;
    return *this;
  }

  bool operator==(const Column&) const = default;

 private:
  friend class Definition<Column>;
  friend class Table;
  static constexpr const char* kind = "column";

  Column() = default;

  static std::int32_t default_width(Type type) noexcept {
    switch (type) {
      case Type::int32:
        return 11;
      case Type::float32:
        return 13;
      case Type::float64:
        return 23;
      case Type::int16:
        return 6;
      case Type::string:
        break;
    }
    return 1;
  }

  // From a definition of the C interface, whose description it takes over.
  static Column from(const TEVPF_COL_DEF& def);
  void load_limits(const TEVPF_COL_DEF& def);
  TEVPF_COL_DEF definition() const;

  std::int32_t width_ = 1;
  bool is_indexed_ = false;
  bool is_unique_ = false;
};

// ---- Implementation -----------------------------------------------------------------------------

// The fields of the record may be unaligned: they are copied by value only.
inline Column Column::from(const TEVPF_COL_DEF& def) {
  const detail::Block<char> text(def.description);
  Column result;
  result.load_texts(def);
  if (text) result.description_buffer(0) = text.get();
  result.width_ = def.width;
  result.is_indexed_ = def.idx_flag != 0;
  result.is_unique_ = def.idx_flag != 0 && def.unq_flag != 0;
  result.load_limits(def);
  return result;
}

inline void Column::load_limits(const TEVPF_COL_DEF& def) {
  switch (def.type) {
    case PF_TYPE_INT:
      return load_bounds(std::int32_t{def.limits.i32.min}, std::int32_t{def.limits.i32.max});
    case PF_TYPE_SHORT:
      return load_bounds(std::int16_t{def.limits.i16.min}, std::int16_t{def.limits.i16.max});
    case PF_TYPE_REAL:
      return load_bounds(float{def.limits.f32.min}, float{def.limits.f32.max},
                         def.limits.f32.precision);
    case PF_TYPE_DOUBLE:
      return load_bounds(double{def.limits.f64.min}, double{def.limits.f64.max},
                         def.limits.f64.precision);
    default:
      return load_no_bounds();
  }
}

inline TEVPF_COL_DEF Column::definition() const {
  TEVPF_COL_DEF def{};
  store_texts(def);
  def.width = width_;
  def.idx_flag = is_indexed_ ? 1 : 0;
  def.unq_flag = is_unique_ ? 1 : 0;
  detail::with_type(type(), [&](auto tag) {
    using T = typename decltype(tag)::type;
    if constexpr (std::same_as<T, std::int32_t>) {
      def.limits.i32 = {stored_max<T>(), stored_min<T>()};
    } else if constexpr (std::same_as<T, std::int16_t>) {
      def.limits.i16 = {stored_max<T>(), stored_min<T>()};
    } else if constexpr (std::same_as<T, float>) {
      def.limits.f32 = {stored_max<T>(), stored_min<T>(), precision()};
    } else if constexpr (std::same_as<T, double>) {
      def.limits.f64 = {stored_max<T>(), stored_min<T>(), precision()};
    }
  });
  return def;
}

}  // namespace v1
}  // namespace tevpf
