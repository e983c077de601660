// Tables and their columns as records.
//
// Terms: a row number counts rows as they are stored; a position counts them as they are traversed,
// which follows the search column's index when there is one.
//
// Invariants: the columns' offsets, row_wid, mod and extra_bytes are what laying them out one
// behind the other into an empty row gives; each index lists every row number once, in ascending
// order of value, with room for num_rows + free_rows; header.btf = 24 + the stored sizes of all
// columns. Rows keep the padding bytes that callers and files hand in; those that the library adds are
// zero.
#pragma once

#include <cstddef>
#include <cstdint>

#include "core/element.h"

namespace tevpf {

inline constexpr std::int32_t kTableHead = 24;  // stored body of a table without columns

// The state of tables/search_keys.
struct SearchKeys {
  unsigned char* values;  // a number column's values side by side; null while there are none
  std::int64_t effort;    // of searches since the last change, in rows looked at
};

}  // namespace tevpf

extern "C" {

#pragma pack(push, 4)
struct TEVPF_COLUMN {
  std::int32_t offset;  // of the value within a row
  char RESERVED[4];     // zero in columns defined here; carried through as read
  TEVPF_COL_DEF def;
  char format[32];          // printf format of a value as reports show it; empty until it is made
  double tolerance;         // reals and doubles: 10^-(precision + 1)
  std::int32_t* idx_ptr;    // row numbers in ascending order of value, while idx_flag is set
  std::int8_t desc_flag;    // 0: no description, else its stored offset - 41
  std::int32_t index_room;  // entries that the index block really has
  tevpf::SearchKeys keys;
};
#pragma pack(pop)

struct TEVPF_TABLE {
  TEVPF_ELEM_HEADER header;
  std::int32_t num_cols;
  std::int32_t num_rows;
  std::int32_t row_wid;      // bytes of a row, padding included
  std::int32_t dsp_wid;      // characters of a formatted row, as the formats were last made
  char RESERVED[8];          // carried through from the file
  std::int16_t free_rows;    // row slots beyond num_rows
  std::int16_t free_cols;    // column slots beyond num_cols
  std::int32_t next_row;     // position that the next step delivers
  std::int32_t cur_row;      // position of the current row, -1: none
  std::int16_t mod;          // alignment of rows: the largest number's size; 0 without numbers
  std::int16_t extra_bytes;  // padding behind the last column's value
  TEVPF_COLUMN* cur_col;     // the search column, or null
  unsigned char* row_data;   // the rows in storage order
  TEVPF_COLUMN* col_array;   // in column order
  unsigned char* dft_row;    // the default row; null until the first column is defined
  TEVPF_COL_DEF* col_dft;    // the five column templates in type order, or null

  std::int64_t row_room;  // bytes that the row block really has
};

static_assert(sizeof(void*) != 4 || sizeof(TEVPF_COL_DEF) == 68);
static_assert(offsetof(TEVPF_COLUMN, def) == 8);
static_assert(offsetof(TEVPF_COLUMN, keys) % alignof(tevpf::SearchKeys) == 0 &&
                  sizeof(TEVPF_COLUMN) % alignof(tevpf::SearchKeys) == 0,
              "search keys lie where they may be referred to");
}

namespace tevpf {

inline bool is_indexed(const TEVPF_COLUMN& column) noexcept { return column.def.idx_flag != 0; }
inline bool is_unique(const TEVPF_COLUMN& column) noexcept {
  return column.def.idx_flag != 0 && column.def.unq_flag != 0;
}

// Releases everything that the table owns, and the record; half-built ones too.
void release_table(TEVPF_TABLE* table) noexcept;

// Gives `copy`, a new empty table, all that `source` holds but its name; false when memory runs
// out, and then `copy` is still empty. Its search column is its own column at the same place.
[[nodiscard]] bool copy_table_body(const TEVPF_TABLE& source, TEVPF_TABLE& copy) noexcept;

}  // namespace tevpf
