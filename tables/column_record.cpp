#include "tables/column_record.h"

#include <cmath>
#include <cstring>
#include <utility>

#include "core/base/heap.h"
#include "core/base/status.h"
#include "core/base/text_field.h"
#include "tables/column_index.h"
#include "tables/layout.h"
#include "values/value_text.h"
#include "values/value_type.h"

namespace tevpf {
namespace {

// The stored position of a description counts from here.
constexpr std::int64_t kDescriptionBase = 41;

TEVPF_STATUS bad_type(std::int32_t type) noexcept { return fail(PF_BADTYPE, "column", Text(type)); }

// The bounds of a number column. NaN bounds are refused for a real and accepted for a double.
template <class T>
bool bounds_in_order(T min, T max) noexcept {
  if constexpr (std::is_same_v<T, float>) {
    return max >= min;
  } else {
    return !(min > max);
  }
}

}  // namespace

void terminate_texts(TEVPF_COL_DEF& definition) noexcept {
  terminate_field(definition.name);
  terminate_field(definition.units);
}

TEVPF_STATUS find_column(const TEVPF_TABLE& table, const char* name,
                         TEVPF_COLUMN*& column) noexcept {
  for (std::int32_t i = 0; i < table.num_cols; ++i) {
    if (std::strcmp(table.col_array[i].def.name, name) == 0) {
      column = &table.col_array[i];
      return PF_NORMAL;
    }
  }
  return fail(PF_NOCOLUMN, name);
}

double tolerance_of(const TEVPF_COL_DEF& definition) noexcept {
  if (!is_floating_type(definition.type)) return 0.0;
  const std::int32_t precision = definition.type == PF_TYPE_REAL ? definition.limits.f32.precision
                                                                 : definition.limits.f64.precision;
  return std::pow(10.0, -(precision + 1.0));
}

std::int64_t stored_column_size(std::int32_t type, const char* description) noexcept {
  const std::int64_t text =
      description == nullptr ? 0 : static_cast<std::int64_t>(std::strlen(description)) + 1;
  return kColumnHead + value_type(type).column_part + text;
}

std::int8_t description_flag(const TEVPF_COL_DEF& definition) noexcept {
  if (definition.description == nullptr) return 0;
  return static_cast<std::int8_t>(stored_column_size(definition.type, nullptr) - kDescriptionBase);
}

TEVPF_STATUS copy_definition(const TEVPF_COL_DEF& source, TEVPF_COL_DEF& copy) noexcept {
  copy = source;
  if (source.description == nullptr) return PF_NORMAL;
  copy.description = heap_copy(source.description);
  return copy.description == nullptr ? fail_empty(PF_NOMEM) : TEVPF_STATUS{PF_NORMAL};
}

TEVPF_STATUS row_too_wide(const TEVPF_COL_DEF& definition) noexcept {
  return fail(PF_BADWIDTH, Text(definition.width), definition.name);
}

void release_column(TEVPF_COLUMN& column) noexcept {
  heap_free(std::exchange(column.def.description, nullptr));
  release_index(column);
}

std::int32_t column_position(const TEVPF_TABLE& table, const TEVPF_COLUMN* column) noexcept {
  return column == nullptr ? -1 : static_cast<std::int32_t>(column - table.col_array);
}

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_calc_col_bytes(std::int32_t type, const char* description,
                                   std::int32_t* bytes_out) noexcept {
  if (!is_value_type(type)) return bad_type(type);
  const std::int64_t bytes = stored_column_size(type, description);
  if (bytes > INT32_MAX) return fail_empty(PF_NOMEM);
  *bytes_out = static_cast<std::int32_t>(bytes);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_construct_column(TEVPF_COLUMN* column, std::int32_t* btf_out,
                                     std::int32_t* size_out, std::int16_t* mod) noexcept {
  TEVPF_COL_DEF& def = column->def;
  if (def.description != nullptr) {
    def.description = heap_copy(def.description);
    if (def.description == nullptr) return fail_empty(PF_NOMEM);
  }
  column->format[0] = '\0';

  std::int32_t size = 0;
  PF_TRY(TEV8R1_compute_size(def.type, def.width, &size));
  if (def.type != PF_TYPE_STRING && *mod < size) *mod = static_cast<std::int16_t>(size);
  PF_TRY(TEV8R1_calc_col_bytes(def.type, def.description, btf_out));
  if (is_floating_type(def.type)) column->tolerance = tolerance_of(def);
  *size_out = size;
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_validate_col_range(const TEVPF_COL_DEF* definition) noexcept {
  const TEVPF_COL_DEF& def = *definition;
  if (!is_value_type(def.type)) return bad_type(def.type);
  if (def.type == PF_TYPE_STRING) return PF_NORMAL;

  return with_number(def.type, [&](auto tag) -> TEVPF_STATUS {
    using T = decltype(tag);
    const auto& limits = limits_of<T>(def);
    const T min = limits.min, max = limits.max;
    if (!bounds_in_order(min, max)) return fail(PF_BADRANGE, number_text(min));
    if constexpr (kIsFloating<T>) {
      const std::int32_t precision = limits.precision;
      if (precision < 1) return fail(PF_BADPREC, Text(precision), def.name);
    }
    return PF_NORMAL;
  });
}

TEVPF_STATUS TEV8R1_validate_col_def(const TEVPF_TABLE* table, TEVPF_COL_DEF definition) noexcept {
  terminate_texts(definition);
  if (starts_with_blank(definition.name)) return fail_empty(PF_BADNAME);
  PF_TRY(TEV8R1_check_unique_column(table, definition.name));
  if (definition.idx_flag != 0 && definition.unq_flag != 0 && table->num_rows > 0) {
    return fail_empty(PF_BADUNIQUE);
  }
  PF_TRY(TEV8R1_validate_col_range(&definition));
  if (definition.width < 1) return fail(PF_BADWIDTH, Text(definition.width), definition.name);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_check_unique_column(const TEVPF_TABLE* table, const char* name) noexcept {
  for (std::int32_t i = 0; i < table->num_cols; ++i) {
    if (std::strcmp(table->col_array[i].def.name, name) == 0) {
      return fail(PF_DUPLICATE, {"column ", name}, {"table ", table->header.elem_name});
    }
  }
  return PF_NORMAL;
}
