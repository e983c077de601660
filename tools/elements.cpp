#include "elements.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <limits>
#include <memory>
#include <type_traits>

#include "failure.h"
#include "messages.h"
#include "text.h"

namespace tool {
namespace {

struct FreeBlock {
  void operator()(void* block) const { std::free(block); }
};

// The bounds of a definition's part. Copied first: its doubles may be aligned to 4 bytes only.
template <class Part>
Bounds bounds_of(const Part& part) {
  const auto min = part.min;
  const auto max = part.max;
  return {min, max};
}

Parameter to_parameter(const TEVPF_PARAM_DEF& def) {
  Parameter result;
  result.name = def.name;
  result.units = def.units;
  result.description = def.description;
  result.type = def.type;
  switch (def.type) {
    case PF_TYPE_INT:
      result.value = std::int32_t{def.part.i32.value};
      result.bounds = bounds_of(def.part.i32);
      break;
    case PF_TYPE_REAL:
      result.value = float{def.part.f32.value};
      result.bounds = bounds_of(def.part.f32);
      result.precision = def.part.f32.precision;
      break;
    case PF_TYPE_DOUBLE:
      result.value = double{def.part.f64.value};
      result.bounds = bounds_of(def.part.f64);
      result.precision = def.part.f64.precision;
      break;
    case PF_TYPE_SHORT:
      result.value = std::int16_t{def.part.i16.value};
      result.bounds = bounds_of(def.part.i16);
      break;
    default:
      result.value = std::string(def.part.str.value);
      break;
  }
  return result;
}

Column to_column(const TEVPF_COL_DEF& def, std::int32_t offset) {
  Column result;
  result.name = def.name;
  result.units = def.units;
  result.description = def.description == nullptr ? "" : def.description;
  result.type = def.type;
  result.width = def.width;
  result.offset = offset;
  result.indexed = def.idx_flag != 0;
  result.unique = def.idx_flag != 0 && def.unq_flag != 0;
  switch (def.type) {
    case PF_TYPE_INT:
      result.bounds = bounds_of(def.limits.i32);
      break;
    case PF_TYPE_REAL:
      result.bounds = bounds_of(def.limits.f32);
      result.precision = def.limits.f32.precision;
      break;
    case PF_TYPE_DOUBLE:
      result.bounds = bounds_of(def.limits.f64);
      result.precision = def.limits.f64.precision;
      break;
    case PF_TYPE_SHORT:
      result.bounds = bounds_of(def.limits.i16);
      break;
    default:
      break;
  }
  return result;
}

Parameter read_parameter(const PfFile& file, const std::string& list, std::int32_t position) {
  std::int32_t type = 0, value_size = 0, desc_size = 0;
  require(TEV8R1_PF_inq_param_size_by_pos(list.c_str(), position, &type, &value_size, &desc_size),
          file.path(), "read a parameter");
  std::string description(static_cast<std::size_t>(desc_size), '\0');
  std::string value(static_cast<std::size_t>(value_size), '\0');
  TEVPF_PARAM_DEF def{};
  def.description = description.data();
  if (type == PF_TYPE_STRING) def.part.str.value = value.data();
  require(TEV8R1_PF_get_param_def_by_pos(list.c_str(), position, &def), file.path(),
          "read a parameter");
  return to_parameter(def);
}

template <class T>
bool is_whole_range(const Bounds& bounds) {
  return std::get<T>(bounds.min) <= std::numeric_limits<T>::lowest() &&
         std::get<T>(bounds.max) >= std::numeric_limits<T>::max();
}

bool is_whole_range(const Bounds& bounds) {
  return std::visit(
      [&](const auto& min) {
        using T = std::decay_t<decltype(min)>;
        if constexpr (std::is_same_v<T, std::string>) {
          return true;
        } else {
          return is_whole_range<T>(bounds);
        }
      },
      bounds.min);
}

}  // namespace

std::vector<Parameter> read_list(const PfFile& file, const std::string& name) {
  std::int32_t count = 0;
  require(TEV8R1_PF_inq_num_params(name.c_str(), &count), file.path(), "read the list");
  std::vector<Parameter> result;
  result.reserve(static_cast<std::size_t>(count));
  for (std::int32_t i = 0; i < count; ++i) result.push_back(read_parameter(file, name, i));
  return result;
}

Parameter find_parameter(const PfFile& file, const std::string& list, const std::string& name) {
  std::int32_t position = 0;
  if (TEV8R1_inq_param_pos(list.c_str(), name.c_str(), &position) == PF_NORMAL) {
    Parameter found = read_parameter(file, list, position);
    if (found.name == name) return found;
  }
  throw Failure(kRefused, visible(file.path()) + ": list " + in_quotes(list) +
                              " has no parameter " + in_quotes(name) +
                              "; 'tevpf show' shows those it has");
}

Table::Table(const PfFile& file, const std::string& name) : file_(file.path()), name_(name) {
  std::int32_t num_cols = 0, num_rows = 0, row_wid = 0, dsp_wid = 0, cur_row = 0;
  require(
      TEV8R1_PF_inq_table_info(name.c_str(), &num_cols, &num_rows, &row_wid, &dsp_wid, &cur_row),
      file_, "read the table");
  std::int32_t count = 0;
  std::int32_t* offsets = nullptr;
  const TEVPF_STATUS status = TEV8R1_PF_inq_col_offsets(name.c_str(), &count, &offsets);
  const std::unique_ptr<std::int32_t[], FreeBlock> owned{offsets};
  require(status, file_, "read the table's columns");
  for (std::int32_t i = 0; i < count; ++i) {
    TEVPF_COL_DEF def{};
    require(TEV8R1_PF_inq_col_def_by_pos(name.c_str(), i, &def), file_, "read a column");
    const std::unique_ptr<char[], FreeBlock> description{def.description};
    columns_.push_back(to_column(def, offsets[i]));
  }
  row_count_ = static_cast<std::size_t>(std::max(num_rows, 0));
  row_size_ = static_cast<std::size_t>(std::max(row_wid, 0));
}

std::size_t Table::column_position(const std::string& name) const {
  std::string all;
  for (std::size_t i = 0; i < columns_.size(); ++i) {
    if (columns_[i].name == name) return i;
    if (i > 0) all += ", ";
    all += visible(columns_[i].name);
  }
  throw Failure(kRefused, visible(file_) + ": table " + in_quotes(name_) + " has no column " +
                              in_quotes(name) + "; it has " + (all.empty() ? "none" : all));
}

void Table::read_row(std::size_t number) {
  row_.resize(row_size_ + 1);
  require(TEV8R1_PF_get_row_by_pos(name_.c_str(), static_cast<std::int32_t>(number), row_.data()),
          file_, "read a row");
}

Value Table::cell(std::size_t column) const {
  const Column& c = columns_[column];
  return load_value(c.type, row_.data() + c.offset);
}

std::string bounds_text(const std::optional<Bounds>& bounds, const std::string& units) {
  if (!bounds || is_whole_range(*bounds)) return {};
  return exact_text(bounds->min) + " to " + exact_text(bounds->max) +
         (units.empty() ? "" : " " + visible(units));
}

std::string refused_value(const std::string& text, std::int32_t type, Parsed parsed,
                          const std::optional<Bounds>& bounds, const std::string& units) {
  const std::string word = type_word(type);
  const std::string article = word == "integer" ? "an " : "a ";
  const std::string range = bounds_text(bounds, units);
  if (parsed == Parsed::kNotANumber) {
    return in_quotes(text) + " is not " + article + word +
           (range.empty() ? "" : "; give a number from " + range);
  }
  if (!range.empty()) return visible(text) + " is out of range; it must lie within " + range;
  return visible(text) + " does not fit " + article + word;
}

}  // namespace tool
