// Lists: ordered, named parameters.
#pragma once

#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <iterator>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

#include "element.hpp"
#include "open_file.hpp"
#include "parameter.hpp"
#include "value.hpp"

namespace tevpf {
inline namespace v1 {

// A list of an open file: a cheap handle that is copied freely. It means its list by name: once the
// list has been deleted, or renamed through another handle, operations throw PF_NOELEM; once the file
// is closed, PF_NOFILE. Beside these, and std::bad_alloc, operations throw what their comment says;
// a refusal has changed nothing.
//
// Names of parameters are exact. Finding one costs O(1) (O(log n) until n / 16 have been looked up
// since names or order changed); n is the number of parameters, and costs are O(1) where none is
// given. Positions count from 0.
class List {
 public:
  class iterator;

  std::string_view name() const noexcept { return name_.view(); }

  // As listed in the file's directory. O(elements of the file).
  std::string description() const;

  std::size_t size() const;
  bool empty() const { return size() == 0; }

  // ---- Values ----

  // The value of a parameter of exactly the type T (text: std::string); the list's cursor, which
  // only C code sees, stays. One call into the library, for texts beyond 255 characters two.
  //   PF_NOPARAM, PF_BADTYPE
  template <Storable T>
  T get(const NameArg& parameter) const;

  // Changes a value. An integer or a fraction becomes a value of the parameter's type, see Cell.
  //   PF_NOPARAM, PF_BADTYPE
  //   PF_RANGE  outside the bounds; the Error's value() is the parameter's name
  void set(const NameArg& parameter, const Cell& value);

  // ---- Parameters ----

  bool contains(const NameArg& parameter) const { return position(parameter).has_value(); }
  std::optional<std::size_t> position(const NameArg& parameter) const;

  // The parameter's definition and value, copied. The iteration and these set the list's cursor.
  //   PF_NOPARAM; PF_BADPOS
  Parameter at(const NameArg& parameter) const;
  Parameter at(std::size_t position) const;
  std::optional<Parameter> find(const NameArg& parameter) const;

  // The first parameter, in name order, whose name starts so. O(log n).
  //   PF_BADARG  the prefix holds a "*"
  std::optional<Parameter> find_prefix(std::string_view prefix) const;

  // All parameters in order: an input range of Parameter. Each step copies one definition; the
  // reference is good until the next step. Parameters may be changed meanwhile; adding, removing and
  // moving them shifts which ones are still to come.
  iterator begin() const;
  std::default_sentinel_t end() const noexcept { return {}; }

  // Adds a parameter at the end, or in front of the one at a position. O(n) moves of index entries.
  //   PF_DUPLICATE  the name is taken
  //   PF_RANGE      the value lies outside the bounds
  //   PF_BADPOS     position > size()
  void add(const Parameter& parameter);
  void insert(std::size_t position, const Parameter& parameter);

  // Replaces everything but the name of the parameter that has the definition's name; the type, too.
  //   PF_NOPARAM, PF_RANGE
  void redefine(const Parameter& parameter);

  // O(n).   PF_NOPARAM; PF_BADNAME, PF_DUPLICATE: the new name
  void rename(const NameArg& parameter, std::string_view new_name);

  // Moves a parameter so that it stands at the position. O(n).   PF_NOPARAM, PF_BADPOS
  void move(const NameArg& parameter, std::size_t position);

  // O(n).   PF_NOPARAM
  void remove(const NameArg& parameter);

  // ---- The list as an element of its file ----

  // This handle follows; others find no list of the old name.   PF_BADNAME, PF_DUPLICATE
  void rename_list(std::string_view new_name);
  void describe(std::string_view description);  // PF_BADARG: more than 79 characters

  // A text file for people to read. O(n).   PF_OPENFAIL
  void dump(const std::filesystem::path& path) const;

 private:
  friend class File;
  List(detail::OpenFilePtr file, detail::Name name) : file_(std::move(file)), name_(name) {}

  const char* select() const {
    file_->select();
    return name_.c_str();
  }
  // Ahead of an operation that may refuse without texts: none of an earlier failure are left.
  const char* select_for_change() const {
    file_->select();
    tevpf_clear_error();
    return name_.c_str();
  }
  // The name of a parameter as the C interface takes it. A name that it would read as a pattern is
  // good only when the parameter found has exactly that name.
  const char* exact(const NameArg& parameter) const {
    if (!parameter.is_whole() || parameter.is_pattern()) [[unlikely]] {
      require_exact(parameter);
    }
    return parameter.c_str();
  }
  void require_exact(const NameArg& parameter) const {
    if (!position(parameter)) throw Error(PF_NOPARAM, std::string(parameter.view()), {});
  }
  std::optional<std::int32_t> position_of(const char* pattern) const;
  Parameter load(std::int32_t position) const;
  void insert_at(std::int32_t position, const Parameter& parameter);

  detail::OpenFilePtr file_;
  detail::Name name_;
};

// An input iterator; *it is valid until ++it.
class List::iterator {
 public:
  using iterator_concept = std::input_iterator_tag;
  using iterator_category = std::input_iterator_tag;
  using value_type = Parameter;
  using difference_type = std::ptrdiff_t;
  using reference = const Parameter&;
  using pointer = const Parameter*;

  reference operator*() const noexcept { return parameter_; }
  pointer operator->() const noexcept { return &parameter_; }
  iterator& operator++() {
    ++position_;
    load();
    return *this;
  }
  void operator++(int) { ++*this; }
  bool operator==(std::default_sentinel_t) const noexcept { return at_end_; }

 private:
  friend class List;
  explicit iterator(List list) : list_(std::move(list)) { load(); }

  void load() {
    const auto count = static_cast<std::int32_t>(list_.size());
    at_end_ = position_ >= count;
    if (!at_end_) parameter_.load(list_.name_.c_str(), position_);
  }

  List list_;
  std::int32_t position_ = 0;
  bool at_end_ = false;
  Parameter parameter_;
};

// ---- Implementation -----------------------------------------------------------------------------

inline std::string List::description() const {
  select();
  return detail::description_of(Kind::list, name());
}

inline std::size_t List::size() const {
  std::int32_t count = 0;
  detail::check(TEV8R1_PF_inq_num_params(select(), &count));
  return static_cast<std::size_t>(count);
}

template <Storable T>
T List::get(const NameArg& parameter) const {
  const char* const name = exact(parameter);
  constexpr auto type = static_cast<std::int32_t>(type_of<T>);
  std::size_t size = 0;
  if constexpr (Number<T>) {
    T value;
    detail::check(tevpf_get_value(select(), name, type, &value, sizeof value, &size));
    return value;
  } else {
    char buffer[256];
    detail::check(tevpf_get_value(select(), name, type, buffer, sizeof buffer, &size));
    if (size <= sizeof buffer) return std::string(buffer, size - 1);
    std::string text(size - 1, '\0');
    detail::check(tevpf_get_value(select(), name, type, text.data(), size, &size));
    return text;
  }
}

inline void List::set(const NameArg& parameter, const Cell& value) {
  const char* const name = exact(parameter);
  const char* const list = select_for_change();
  std::int32_t type = 0;
  detail::check(TEV8R1_get_param_type(list, name, &type));
  const Value given =
      detail::to_value(static_cast<Type>(type), value, {"parameter", parameter.view()});
  const TEVPF_STATUS status = TEV8R1_PF_modify_param(list, name, detail::bytes_of(given));
  if (status != PF_NORMAL) detail::raise(status, parameter.view());
}

inline std::optional<std::int32_t> List::position_of(const char* pattern) const {
  std::int32_t position = 0;
  const TEVPF_STATUS status = TEV8R1_inq_param_pos(select(), pattern, &position);
  if (status == PF_NOPARAM) return std::nullopt;
  detail::check(status);
  return position;
}

inline std::optional<std::size_t> List::position(const NameArg& parameter) const {
  if (!parameter.is_whole()) return std::nullopt;
  const std::optional<std::int32_t> found = position_of(parameter.c_str());
  if (!found) return std::nullopt;
  if (parameter.is_pattern() && load(*found).name() != parameter.view()) return std::nullopt;
  return static_cast<std::size_t>(*found);
}

inline Parameter List::load(std::int32_t position) const {
  Parameter result;
  result.load(select(), position);
  return result;
}

inline Parameter List::at(std::size_t position) const {
  const std::size_t count = size();
  if (position >= count) {
    throw Error(PF_BADPOS, std::to_string(position), std::to_string(count));
  }
  return load(static_cast<std::int32_t>(position));
}

inline Parameter List::at(const NameArg& parameter) const {
  const std::optional<std::size_t> found = position(parameter);
  if (!found) throw Error(PF_NOPARAM, std::string(parameter.view()), {});
  return load(static_cast<std::int32_t>(*found));
}

inline std::optional<Parameter> List::find(const NameArg& parameter) const {
  const std::optional<std::size_t> found = position(parameter);
  if (!found) return std::nullopt;
  return load(static_cast<std::int32_t>(*found));
}

inline std::optional<Parameter> List::find_prefix(std::string_view prefix) const {
  if (prefix.find_first_of(std::string_view("*\0", 2)) != std::string_view::npos) {
    throw Error(PF_BADARG, std::string(prefix), {});
  }
  const std::optional<std::int32_t> found = position_of((std::string(prefix) + '*').c_str());
  if (!found) return std::nullopt;
  return load(*found);
}

inline List::iterator List::begin() const { return iterator(*this); }

inline void List::insert_at(std::int32_t position, const Parameter& parameter) {
  const TEVPF_PARAM_DEF def = parameter.definition();
  const TEVPF_STATUS status = TEV8R1_PF_add_param(select_for_change(), &def, position);
  if (status != PF_NORMAL) detail::raise(status, parameter.name());
}

inline void List::add(const Parameter& parameter) { insert_at(PF_END_POS, parameter); }

inline void List::insert(std::size_t position, const Parameter& parameter) {
  const std::size_t count = size();
  if (position > count) throw Error(PF_BADPOS, std::to_string(position), std::to_string(count));
  insert_at(static_cast<std::int32_t>(position), parameter);
}

inline void List::redefine(const Parameter& parameter) {
  exact(parameter.name());
  const TEVPF_STATUS status =
      TEV8R1_PF_modify_param_def(select_for_change(), parameter.definition());
  if (status != PF_NORMAL) detail::raise(status, parameter.name());
}

inline void List::rename(const NameArg& parameter, std::string_view new_name) {
  const char* const old_name = exact(parameter);
  const detail::Name name = detail::new_name(new_name);
  if (new_name.starts_with(' ')) throw Error(PF_BADNAME, {}, {});
  detail::check(TEV8R1_PF_modify_param_name(select(), old_name, name.c_str()));
}

inline void List::move(const NameArg& parameter, std::size_t position) {
  const char* const name = exact(parameter);
  const std::size_t count = size();
  if (position >= count && contains(parameter)) {
    throw Error(PF_BADPOS, std::to_string(position), std::to_string(count));
  }
  detail::check(
      TEV8R1_PF_move_param(select_for_change(), name, static_cast<std::int32_t>(position)));
}

inline void List::remove(const NameArg& parameter) {
  const char* const name = exact(parameter);
  detail::check(TEV8R1_PF_delete_param(select(), name));
}

inline void List::rename_list(std::string_view new_name) {
  const detail::Name name = detail::new_name(new_name);
  detail::check(TEV8R1_modify_elem_name(PF_ELEM_LIST, select_for_change(), name.c_str()));
  name_ = name;
}

inline void List::describe(std::string_view description) {
  const std::string text = detail::element_description(description);
  detail::check(TEV8R1_modify_elem_desc(PF_ELEM_LIST, select(), text.c_str()));
}

inline void List::dump(const std::filesystem::path& path) const {
  detail::check(TEV8R1_PF_dump_list(select(), detail::name_of(path).c_str()));
}

}  // namespace v1
}  // namespace tevpf
