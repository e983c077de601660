// What definitions of parameters and of columns have in common.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

#include "open_file.hpp"
#include "value.hpp"

namespace tevpf {
inline namespace v1 {

// A plain value without connection to a file. Setters return the definition, so that they chain, and
// refuse at once what no file could take:
//   name         PF_BADNAME: more than 19 characters, a blank at the front
//   units        PF_BADARG: more than 7 characters
//   bounds       PF_BADTYPE: a string; PF_RANGE: beyond the type's range; PF_BADRANGE: max below min
//   precision    PF_BADPREC: below 1
template <class Self>
class Definition {
 public:
  Type type() const noexcept { return type_; }
  const std::string& name() const noexcept { return name_; }
  const std::string& units() const noexcept { return units_; }
  const std::string& description() const noexcept { return description_; }  // empty: none
  // Of numbers; none for strings. A new definition has those of its type.
  const std::optional<Bounds>& bounds() const noexcept { return bounds_; }
  // Significant digits shown, of reals and doubles; 6 in a new definition, 0 for the other types.
  std::int32_t precision() const noexcept { return precision_; }

  Self& name(std::string_view text) {
    detail::new_name(text);
    if (text.starts_with(' ')) throw Error(PF_BADNAME, {}, {});
    name_ = text;
    return self();
  }
  Self& units(std::string_view text) {
    detail::check_text(text, TEVPF_UNITS_SIZE, PF_BADARG, "the unit");
    units_ = text;
    return self();
  }
  Self& description(std::string_view text) {
    description_ = detail::to_text(text, {"description of", name_});
    return self();
  }
  Self& bounds(const Cell& min, const Cell& max) {
    const detail::Subject subject{Self::kind, name_};
    if (type_ == Type::string) detail::raise_type(subject, type_);
    Bounds given{detail::to_value(type_, min, subject), detail::to_value(type_, max, subject)};
    if (given.max < given.min) throw Error(PF_BADRANGE, {}, {});
    bounds_ = std::move(given);
    return self();
  }
  Self& precision(std::int32_t digits) {
    if (digits < 1) throw Error(PF_BADPREC, std::to_string(digits), name_);
    if (has_precision()) precision_ = digits;
    return self();
  }

  bool operator==(const Definition&) const = default;

 protected:
  Definition() = default;  // to be loaded
  Definition(std::string_view new_name, Type type) : type_(type) {
    name(new_name);
    precision_ = has_precision() ? 6 : 0;
    detail::with_type(type, [this](auto tag) {
      using T = typename decltype(tag)::type;
      if constexpr (Number<T>) bounds_ = Bounds{detail::lowest<T>, detail::highest<T>};
    });
  }

  // From a definition of the C interface.
  template <class Def>
  void load_texts(const Def& def) {
    type_ = static_cast<Type>(def.type);
    name_ = def.name;
    units_ = def.units;
    precision_ = 0;
  }
  template <class T>
  void load_bounds(T min, T max, std::int32_t precision = 0) {
    bounds_ = Bounds{min, max};
    precision_ = precision;
  }
  // Room for a description, whose text the caller then cuts to its length.
  std::string& description_buffer(std::size_t size) {
    description_.resize(size);
    return description_;
  }
  void load_no_bounds() { bounds_.reset(); }

  // Into one. The texts stay this object's.
  template <class Def>
  void store_texts(Def& def) const {
    def.type = static_cast<std::int32_t>(type_);
    std::memcpy(def.name, name_.c_str(), name_.size() + 1);
    std::memcpy(def.units, units_.c_str(), units_.size() + 1);
    def.description = description_.empty() ? nullptr : const_cast<char*>(description_.c_str());
  }
  template <class T>
  T stored_min() const {
    return std::get<T>(bounds_->min);
  }
  template <class T>
  T stored_max() const {
    return std::get<T>(bounds_->max);
  }

 private:
  Self& self() noexcept { return static_cast<Self&>(*this); }
  bool has_precision() const noexcept { return type_ == Type::float32 || type_ == Type::float64; }

  Type type_ = Type::int32;
  std::int32_t precision_ = 0;
  std::string name_, units_, description_;
  std::optional<Bounds> bounds_;
};

}  // namespace v1
}  // namespace tevpf
