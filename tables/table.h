// Tables and their columns as records.
//
// Terms. A slot is a place in the row block; a row keeps its slot as long as it is in the table. A
// row number counts rows in storage order. A position counts rows in traversal order, which is that
// of the search column's index if there is one.
//
// Invariants: the columns' offsets, row_wid, mod and extra_bytes result from laying the columns out
// one after another into an empty row. Each index lists every row's slot once, in ascending order
// of value. header.btf = 24 + the stored sizes of all columns. Padding bytes from callers and files
// are kept; padding that the library adds is zero.
//
// A table is settled when its rows are in storage order, so that slots are row numbers, and every
// index is one array with room for num_rows + free_rows entries. Outside callers may then read and
// change row_data and idx_ptr. Changes in the middle of a table unsettle it; tables/settle settles
// it again.
#pragma once

#include <cstddef>
#include <cstdint>

#include "core/element.h"
#include "core/sequence/sequence.h"

namespace tevpf {

inline constexpr std::int32_t kTableHead = 24;  // stored body of a table without columns

// The state of tables/search_keys.
struct SearchKeys {
  unsigned char* values;  // a contiguous copy of a number column's values; null if there is none
  std::int64_t effort;    // of searches since the last change, in rows scanned
};

// The state of tables/row_store.
struct RowSlots {
  Sequence order;          // slots in storage order; an identity as long as slots are row numbers
  std::int32_t* free;      // slots below num_rows + num_free that hold no row
  std::int32_t num_free;   // 0 while the order is an identity
  std::int32_t free_room;  // entries that the block of `free` holds
  std::int64_t bytes;      // size of the row block
};

}  // namespace tevpf

extern "C" {

#pragma pack(push, 4)
struct TEVPF_COLUMN {
  std::int32_t offset;  // of the value within a row
  char RESERVED[4];     // zero in columns defined here; kept as read from a file
  TEVPF_COL_DEF def;
  char format[32];   // printf format of a value in reports; empty until it is made
  double tolerance;  // reals and doubles: 10^-(precision + 1)
  union {
    std::int32_t* idx_ptr;  // of a settled table: row numbers in ascending order of value
    tevpf::Sequence index;  // slots in that order, if idx_flag is set
  };
  std::int8_t desc_flag;  // 0: no description, else its stored offset - 41
  char padding[7];
  tevpf::SearchKeys keys;
};
#pragma pack(pop)

struct TEVPF_TABLE {
  TEVPF_ELEM_HEADER header;
  std::int32_t num_cols;
  std::int32_t num_rows;
  std::int32_t row_wid;      // bytes of a row, padding included
  std::int32_t dsp_wid;      // characters of a formatted row, as of the last making of formats
  char RESERVED[8];          // kept as read from the file
  std::int16_t free_rows;    // row slots beyond num_rows
  std::int16_t free_cols;    // column slots beyond num_cols
  std::int32_t next_row;     // position that the next step returns
  std::int32_t cur_row;      // position of the current row, -1: none
  std::int16_t mod;          // alignment of rows: the size of the largest number; 0 without numbers
  std::int16_t extra_bytes;  // padding after the last column's value
  TEVPF_COLUMN* cur_col;     // the search column, or null
  unsigned char* row_data;   // the rows by slot; of a settled table: in storage order
  TEVPF_COLUMN* col_array;   // in column order
  unsigned char* dft_row;    // the default row; null until the first column is defined
  TEVPF_COL_DEF* col_dft;    // the five column templates in type order, or null

  tevpf::RowSlots slots;
  std::int64_t reads;  // rows read since the last change, while the table is not settled
};

static_assert(sizeof(void*) != 4 || sizeof(TEVPF_COL_DEF) == 68);
static_assert(offsetof(TEVPF_COLUMN, def) == 8);
static_assert(offsetof(TEVPF_COLUMN, keys) % alignof(tevpf::SearchKeys) == 0 &&
                  offsetof(TEVPF_COLUMN, index) % alignof(tevpf::Sequence) == 0 &&
                  sizeof(TEVPF_COLUMN) % alignof(tevpf::Sequence) == 0,
              "what is more than a field lies where it may be referred to");
}

namespace tevpf {

inline bool is_indexed(const TEVPF_COLUMN& column) noexcept { return column.def.idx_flag != 0; }
inline bool is_unique(const TEVPF_COLUMN& column) noexcept {
  return column.def.idx_flag != 0 && column.def.unq_flag != 0;
}

// Releases the record and everything that the table owns; accepts half-built tables.
void release_table(TEVPF_TABLE* table) noexcept;

// Copies everything that `source` holds except its name to `copy`, a new empty table. Returns false
// when out of memory, and `copy` is still empty. The copy's search column is its own column at the
// same position.
[[nodiscard]] bool copy_table_body(const TEVPF_TABLE& source, TEVPF_TABLE& copy) noexcept;

}  // namespace tevpf
