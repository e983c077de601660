/* Reading for callers that share the library with others: nothing here moves a cursor, sets a search
 * column or selects a file, and nothing writes beyond a buffer whose size the caller states. It is
 * what the C++ interface stands on beside tevpf.h.
 *
 * Where a list or table is named: PF_NOFILE, PF_NOELEM. A failure leaves the out-arguments untouched.
 *
 * C99 and C++. */
#ifndef TEVPF_ACCESS_H
#define TEVPF_ACCESS_H

#include <stddef.h>

#include "tevpf.h"

#ifdef __cplusplus
extern "C" {
#endif

/* A handle of the current file, null without one: compared with the handle taken after the file was
 * opened, it tells whether that file is current. A handle is good for comparing only, and only until
 * its file is closed. */
TEVPF_API const void* tevpf_current_file(void) TEVPF_NOEXCEPT;

/* Copies the value of a parameter of a known type. Costs as TEV8R1_PF_get_param_value.
 *   type            PF_TYPE_...
 *   value_out       receives the value when it takes no more than `size` bytes; else it is untouched
 *   value_size_out  receives the bytes that the value takes, a string's terminator included
 *   PF_NOPARAM  no such parameter
 *   PF_BADTYPE  it has another type; texts: "parameter" and its name, its type in words */
TEVPF_API TEVPF_STATUS tevpf_get_value(const char* list_name, const char* param_name, int32_t type,
                                       void* value_out, size_t size,
                                       size_t* value_size_out) TEVPF_NOEXCEPT;

/* Copies neighbouring rows, one behind the other. O(rows copied).
 *   order_name   an indexed column, whose order the positions follow; null for storage order
 *   first        position of the first row; behind the last one there are none to copy
 *   count        in: how many are wanted; out: how many there were and were copied
 *   row_size     what the caller takes for the bytes of a row
 *   rows_out     count * row_size bytes
 *   numbers_out  receives the rows' numbers in storage order, count of them; or null
 *   PF_NOCOLUMN   no such column
 *   PF_BADSEARCH  it has no index
 *   PF_BADPOS     first or count is negative
 *   PF_BADARG     rows have another size: the columns have changed */
TEVPF_API TEVPF_STATUS tevpf_get_rows(const char* table_name, const char* order_name, int32_t first,
                                      int32_t* count, int32_t row_size, void* rows_out,
                                      int32_t* numbers_out) TEVPF_NOEXCEPT;

/* Searches for a row like TEV8R1_PF_get_row_by_value: in the column's own order when it has an index,
 * and then in O(log n), else in storage order and O(n).
 *   mode, key     as there; mode 1 acts where the column has an index
 *   first         position from which on rows are searched
 *   row_size      what the caller takes for the bytes of a row
 *   row_out       row_size bytes
 *   position_out  receives the row's position in that order
 *   number_out    receives its number in storage order
 *   PF_NOTFOUND, PF_NOCOLUMN
 *   PF_BADPOS   first is negative
 *   PF_BADARG   rows have another size: the columns have changed */
TEVPF_API TEVPF_STATUS tevpf_find_row(const char* table_name, const char* column_name, int8_t mode,
                                      const void* key, int32_t first, int32_t row_size,
                                      void* row_out, int32_t* position_out,
                                      int32_t* number_out) TEVPF_NOEXCEPT;

#ifdef __cplusplus
}
#endif

#endif
