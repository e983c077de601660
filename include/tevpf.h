/* libtevpf: named technical parameters and tables in binary parameter files.
 *
 * A parameter file holds lists (ordered, named, typed parameters with bounds, units, precision and
 * description) and tables (typed columns over rows of fixed width). A file is read whole into
 * memory when it is opened and written whole when it is saved; in between, all work is done in
 * memory.
 *
 * Conventions
 *   Statuses   Every operation returns one TEVPF_STATUS unless its comment says otherwise. Compare
 *              it for equality with a name below: PF_NORMAL is success, PF_NEWFILE and PF_NOMORE
 *              are results. "Not found" statuses of a group stand at the head of the group.
 *   Texts      NUL-terminated 8-bit texts; never null unless the comment says "or null". Texts
 *              handed in are copied; the library keeps no caller's pointer.
 *   Names      Elements, parameters and columns: at most 19 characters; longer ones are cut when
 *              they are stored, and find nothing when they are looked up. Descriptions of elements:
 *              at most 79 characters, cut likewise.
 *   Buffers    Results go to storage of the caller, sized as the comment says. Blocks that an
 *              operation hands out come from malloc and are released by the caller with free of the
 *              same C runtime. A failure leaves out-arguments untouched unless the comment
 *              says otherwise.
 *   Refusals   An operation checks first and changes afterwards: when it fails, its list, table or
 *              file is as before, unless the comment says what stays. PF_NOMEM can come from every
 *              operation that allocates.
 *   Threads    None: all state (open files, current file, settings) is process-wide. Use the
 *              library from one thread at a time.
 *   Costs      Given in n, the number of parameters, rows or elements at hand; O(1) where none is
 *              given. Beside that, every operation finds what is named: an element in O(1), a
 *              parameter by its exact name in O(1) (in O(log n) until n / 16 have been looked up
 *              since the list's names or order changed, and by a pattern), a column among the
 *              columns one by one.
 *
 * C99 and C++. Little-endian hosts. */
#ifndef TEVPF_H
#define TEVPF_H

#include <stdint.h>

#define TEVPF_VERSION_MAJOR 1
#define TEVPF_VERSION_MINOR 0
#define TEVPF_VERSION_PATCH 0

/* How the operations are linked, the four cases:
 *   build the shared library   TEVPF_BUILD is defined   exported
 *   use the shared library     nothing is defined       imported (this is what matters on Windows)
 *   build the static library   TEVPF_STATIC is defined  plain
 *   use the static library     TEVPF_STATIC is defined  plain; CMake's tevpf::tevpf_static and the
 *                              pkg-config file's --static flags define it for you */
#if defined(TEVPF_STATIC)
#define TEVPF_API
#elif defined(_WIN32) && defined(TEVPF_BUILD)
#define TEVPF_API __declspec(dllexport)
#elif defined(_WIN32)
#define TEVPF_API __declspec(dllimport)
#elif defined(__GNUC__)
#define TEVPF_API __attribute__((visibility("default")))
#else
#define TEVPF_API
#endif

#ifdef __cplusplus
#define TEVPF_NOEXCEPT noexcept
extern "C" {
#else
#define TEVPF_NOEXCEPT
#endif

/* ---- Statuses ------------------------------------------------------------------------------- */

/* Facility 0x960 in bits 16-27, bit 15 set, message number in bits 3-14, severity in bits 0-2. */
typedef uint32_t TEVPF_STATUS;

#define TEVPF_SEVERITY_WARNING 0
#define TEVPF_SEVERITY_SUCCESS 1
#define TEVPF_SEVERITY_ERROR 2
#define TEVPF_SEVERITY_INFORMATIONAL 3

#define PF_NORMAL ((TEVPF_STATUS)0x09608009u)    /* success */
#define PF_NEWFILE ((TEVPF_STATUS)0x09608013u)   /* opened; the file is new and empty */
#define PF_NOMORE ((TEVPF_STATUS)0x0960801Bu)    /* a traversal has passed its last entry */
#define PF_NOTEXACT ((TEVPF_STATUS)0x09608023u)  /* internal: nearest found a greater value */
#define PF_INITDONE ((TEVPF_STATUS)0x09608028u)  /* the library was already initialised */
#define PF_NOTFOUND ((TEVPF_STATUS)0x09608030u)  /* no row holds the value */
#define PF_FILEOPEN ((TEVPF_STATUS)0x09608038u)  /* a file of that name is already open */
#define PF_BADSEARCH ((TEVPF_STATUS)0x09608042u) /* the search column has no index */
#define PF_BADPOS ((TEVPF_STATUS)0x0960804Au)    /* a position lies outside the element */
#define PF_DUPLICATE ((TEVPF_STATUS)0x09608052u) /* the name, or a unique value, is already used */
#define PF_CMPFAIL ((TEVPF_STATUS)0x0960805Au)   /* a comparison in an index search failed */
#define PF_NOFILE ((TEVPF_STATUS)0x09608062u)    /* no file is current, or none has that name */
#define PF_BADTYPE ((TEVPF_STATUS)0x09608072u)   /* no such element type or value type */
#define PF_NOMEM ((TEVPF_STATUS)0x0960807Au)     /* a memory allocation failed */
#define PF_NOCURROW ((TEVPF_STATUS)0x09608082u)  /* the table has no current row */
#define PF_NOCOLUMN ((TEVPF_STATUS)0x0960808Au)  /* the table has no such column */
#define PF_NOELEM ((TEVPF_STATUS)0x09608092u)    /* the file has no such list or table */
#define PF_NOPARAM ((TEVPF_STATUS)0x0960809Au)   /* the list has no such parameter */
#define PF_NOTUNIQUE ((TEVPF_STATUS)0x096080A2u) /* two rows already hold the same value */
#define PF_OPENFAIL ((TEVPF_STATUS)0x096080AAu)  /* a file cannot be opened, created or written */
#define PF_RANGE ((TEVPF_STATUS)0x096080B2u)     /* a value lies outside its range */
#define PF_BADFORMAT ((TEVPF_STATUS)0x096080BAu) /* the file ends inside an element or is damaged */
#define PF_BADCOLCHG ((TEVPF_STATUS)0x096080C2u) /* string width of a table with rows is fixed */
#define PF_BADARG ((TEVPF_STATUS)0x096080D2u)   /* an invalid argument, or text that is no number */
#define PF_BADWIDTH ((TEVPF_STATUS)0x096080DAu) /* a column's width is less than 1, or too large */
#define PF_BADPREC ((TEVPF_STATUS)0x096080E2u)  /* a precision is less than 1 */
#define PF_NOPRIV ((TEVPF_STATUS)0x096080EAu)   /* the file may not be written */
#define PF_BADNAME ((TEVPF_STATUS)0x096080F2u)  /* a name starts with a blank */
#define PF_BADFILE ((TEVPF_STATUS)0x096080FAu)  /* not a parameter file; it was closed again */
#define PF_BADUNIQUE ((TEVPF_STATUS)0x09608102u) /* no unique index on a table that has rows */
#define PF_BADRANGE ((TEVPF_STATUS)0x0960810Au)  /* a maximum is less than its minimum */
#define PF_TYPECHG ((TEVPF_STATUS)0x09608112u)   /* a column with rows cannot change its type */
#define PF_SEARCHSET ((TEVPF_STATUS)0x0960811Au) /* rows cannot move while a search column is set */

/* ---- Codes, sizes and records --------------------------------------------------------------- */

#define PF_ELEM_LIST 1
#define PF_ELEM_TABLE 2

#define PF_TYPE_INT 11    /* int32_t */
#define PF_TYPE_REAL 12   /* float */
#define PF_TYPE_STRING 13 /* NUL-terminated text; in a row: width + 1 bytes */
#define PF_TYPE_DOUBLE 14 /* double */
#define PF_TYPE_SHORT 15  /* int16_t */

#define PF_END_POS 0x7FFFFFFF /* position argument: at the end */

#define TEVPF_NAME_SIZE 20       /* names, terminator included */
#define TEVPF_UNITS_SIZE 8       /* units, terminator included */
#define TEVPF_DESC_SIZE 80       /* element descriptions, terminator included */
#define TEVPF_FILE_NAME_SIZE 258 /* names of open files, terminator included */

#pragma pack(push, 4)

/* Definition of one parameter. `part` is read by `type`. */
typedef struct TEVPF_PARAM_DEF {
  int32_t type; /* PF_TYPE_... */
  char name[TEVPF_NAME_SIZE];
  char units[TEVPF_UNITS_SIZE];
  char* description; /* or null for none */
  union {
    struct {
      int32_t value, max, min;
    } i32; /* PF_TYPE_INT */
    struct {
      int32_t precision; /* significant digits shown, at least 1 */
      float value, max, min;
    } f32; /* PF_TYPE_REAL */
    struct {
      int32_t length; /* of value, without its terminator */
      char* value;
    } str; /* PF_TYPE_STRING */
    struct {
      int32_t precision;
      double value, max, min; /* 4-byte aligned: copy, do not point at them */
    } f64;                    /* PF_TYPE_DOUBLE */
    struct {
      int16_t value, max, min;
    } i16; /* PF_TYPE_SHORT */
  } part;
} TEVPF_PARAM_DEF;

/* Definition of one column. `limits` is read by `type`; strings have none. */
typedef struct TEVPF_COL_DEF {
  char* description; /* or null for none */
  uint32_t spare;    /* copied with the definition, never interpreted or stored */
  int32_t type;      /* PF_TYPE_... */
  char name[TEVPF_NAME_SIZE];
  char units[TEVPF_UNITS_SIZE];
  int8_t desc_byte;  /* 0 */
  int8_t spare_byte; /* never interpreted */
  int8_t idx_flag;   /* 1: the column has an index */
  int8_t unq_flag;   /* 1: no two rows hold the same value; kept together with idx_flag only */
  int32_t width;     /* display width in characters; strings: also the largest text length */
  union {
    struct {
      int32_t max, min;
    } i32; /* PF_TYPE_INT */
    struct {
      float max, min;
      int32_t precision; /* significant digits shown; values are equal within 10^-(precision + 1) */
    } f32;               /* PF_TYPE_REAL */
    struct {
      double max, min;
      int32_t precision;
    } f64; /* PF_TYPE_DOUBLE */
    struct {
      int16_t max, min;
    } i16; /* PF_TYPE_SHORT */
  } limits;
} TEVPF_COL_DEF;

#pragma pack(pop)

/* ---- Library and files ----------------------------------------------------------------------
 * PF_NOFILE: no file is open, so none is current. */

/* Initialises the library, once, before anything else: files that are open already are forgotten,
 * neither written nor closed. Reads the environment variable TEV8R1_debug (defined, even empty:
 * dumps show internal fields, and moving a column prints the new places to standard output);
 * without this call the library works, with debug output off.
 *   PF_INITDONE  it was initialised before: files stay open, TEV8R1_debug was looked at again */
TEVPF_API TEVPF_STATUS TEV8R1_PF_init(void) TEVPF_NOEXCEPT;

/* Opens a parameter file and makes it current; creates an empty one when there is none, or when it
 * may neither be updated nor read but written. O(file size).
 *   name  path; a leading "$NAME", up to the first "/", is replaced by the value of the environment
 *         variable "$NAME", the "$" being part of the variable's name. At most 257 characters after
 *         that: the name by which the file is known from then on.
 *   PF_NEWFILE    open, new and empty; it is deleted again if it is closed without ever being saved
 *   PF_FILEOPEN   already open under this name; the current file stays as it was
 *   PF_OPENFAIL   cannot be opened or created, undefined "$" variable, or name too long
 *   PF_BADFILE    not a parameter file; closed again, current is what closing a file makes current
 *   PF_BADFORMAT, PF_BADTYPE, PF_DUPLICATE
 *                 loading stopped part-way: the file is open and current with what was loaded
 *   PF_NOMEM      the same, or else memory ran out before the file was opened: then the current
 *                 file stays as it was */
TEVPF_API TEVPF_STATUS TEV8R1_PF_open(const char* name) TEVPF_NOEXCEPT;

/* Makes the open file of that name (as translated by open) current.
 *   PF_NOFILE  none is open under this name */
TEVPF_API TEVPF_STATUS TEV8R1_PF_change_file(const char* name) TEVPF_NOEXCEPT;

/* Copies the current file's name.
 *   name_out  at least TEVPF_FILE_NAME_SIZE bytes */
TEVPF_API TEVPF_STATUS TEV8R1_PF_inq_current_file(char* name_out) TEVPF_NOEXCEPT;

/* 1 when the current file may be written, 0 when it could only be opened for reading. */
TEVPF_API TEVPF_STATUS TEV8R1_PF_inq_file_access(int32_t* access_out) TEVPF_NOEXCEPT;

/* Names and descriptions of the current file's elements, in directory order. O(n).
 *   file_name_out  at least TEVPF_FILE_NAME_SIZE bytes
 *   ..._out        receive new arrays of 20-byte names and 80-byte descriptions, released by the
 *                  caller with free; not written when their count is 0
 *   PF_NOMEM  arrays handed out before the failure belong to the caller */
TEVPF_API TEVPF_STATUS TEV8R1_PF_inq_file_elements(
    char* file_name_out, int32_t* num_lists_out, char (**list_names_out)[TEVPF_NAME_SIZE],
    char (**list_descs_out)[TEVPF_DESC_SIZE], int32_t* num_tables_out,
    char (**table_names_out)[TEVPF_NAME_SIZE],
    char (**table_descs_out)[TEVPF_DESC_SIZE]) TEVPF_NOEXCEPT;

/* Writes the current file whole: in place (path null or its own name), or as a copy to another
 * path, which is taken literally; the copy is not opened, and the file is as unsaved as it was.
 * O(file size).
 *   PF_NOPRIV    read-only, or the system refuses access to the path
 *   PF_OPENFAIL  cannot be opened, or not everything could be written. What is in memory is whole
 *                and can be saved again; on the disk is the old file where it can be replaced in
 *                one step, else (a copy, too) possibly a part of the new one */
TEVPF_API TEVPF_STATUS TEV8R1_PF_save(const char* path) TEVPF_NOEXCEPT;

/* Closes the current file, writing it first when save is not 0, and releases it. The file opened
 * before it becomes current; for the first one, the one opened after it.
 * O(file size), the writing and the releasing.
 *   PF_NOPRIV    save of a read-only file: it stays open. Every other outcome closes it
 *   PF_OPENFAIL  it could not be written, and what was in memory is lost; save first where that
 *                matters */
TEVPF_API TEVPF_STATUS TEV8R1_PF_close(int32_t save) TEVPF_NOEXCEPT;

/* Sets how many slots arrays of parameters and rows get at first (default 25) and each time they
 * are full (default 10); 0 restores the default.
 *   PF_BADARG  an argument is negative: that setting stays, the other one is applied */
TEVPF_API TEVPF_STATUS TEV8R1_PF_set_memory_allocation(int32_t initial,
                                                       int32_t increment) TEVPF_NOEXCEPT;

/* ---- Elements of the current file -----------------------------------------------------------
 * PF_NOFILE: no file is current. PF_NOELEM: the file has no list (table) of that exact name.
 * Lists and tables have separate name spaces. */

/* Creates an empty list or table at the end of the directory.
 *   PF_BADNAME    the name starts with a blank
 *   PF_BADTYPE    elem_type is neither PF_ELEM_LIST nor PF_ELEM_TABLE
 *   PF_DUPLICATE  an element of that kind has the same first 19 characters
 *   PF_NOMEM      a new list that got no room for parameters stays, empty */
TEVPF_API TEVPF_STATUS TEV8R1_PF_create_elem(const char* name, const char* description,
                                             int32_t elem_type) TEVPF_NOEXCEPT;

/* PF_NORMAL when no list (table) has the same first 19 characters, else PF_DUPLICATE. They assume a
 * current file; without one they answer PF_NOFILE. */
TEVPF_API TEVPF_STATUS TEV8R1_check_list_unique(const char* name) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_check_table_unique(const char* name) TEVPF_NOEXCEPT;

/* Renames an element. Equal first 19 characters: PF_NORMAL at once, nothing is checked.
 *   PF_BADNAME, PF_BADTYPE, PF_DUPLICATE as for creating; the duplicate comes before PF_NOELEM */
TEVPF_API TEVPF_STATUS TEV8R1_modify_elem_name(int32_t elem_type, const char* old_name,
                                               const char* new_name) TEVPF_NOEXCEPT;

/* Replaces an element's description.
 *   PF_BADTYPE  elem_type is neither PF_ELEM_LIST nor PF_ELEM_TABLE */
TEVPF_API TEVPF_STATUS TEV8R1_modify_elem_desc(int32_t elem_type, const char* name,
                                               const char* description) TEVPF_NOEXCEPT;

/* Deletes an element with everything it holds. O(n) elements and what it holds. */
TEVPF_API TEVPF_STATUS TEV8R1_PF_delete_list(const char* name) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_PF_delete_table(const char* name) TEVPF_NOEXCEPT;

/* Copies an element, whole and with storage of its own, to the end of the directory.
 * O(its size).
 *   PF_BADNAME    the new name starts with a blank
 *   PF_DUPLICATE  an element of that kind has the same first 19 characters */
TEVPF_API TEVPF_STATUS TEV8R1_PF_copy_list(const char* source_name,
                                           const char* new_name) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_PF_copy_table(const char* source_name,
                                            const char* new_name) TEVPF_NOEXCEPT;

/* ---- Values ---------------------------------------------------------------------------------
 * PF_BADTYPE: the type is none of PF_TYPE_INT .. PF_TYPE_SHORT. */

/* Bytes of one value: 4, 4, width + 1 (strings), 8, 2. */
TEVPF_API TEVPF_STATUS TEV8R1_compute_size(int32_t type, int32_t width,
                                           int32_t* size_out) TEVPF_NOEXCEPT;

/* Converts text to the binary form of the type.
 * O(its length), like everything that takes a text.
 *   destination  storage of the value's size; for strings room for the whole text and terminator
 *   PF_BADARG  not a number of that type, or something behind it (blanks included)
 *   PF_RANGE   a number outside the type's range */
TEVPF_API TEVPF_STATUS TEV8R1_from_char(int32_t type, const char* text,
                                        void* destination) TEVPF_NOEXCEPT;

/* The numeric conversions on their own. An integer's range is judged by the length of its text:
 * more than 10 digits, leading zeros included, are out of range. Empty text gives 0; for doubles
 * it leaves the result as it was. Statuses as above. */
TEVPF_API TEVPF_STATUS TEV8R1_convert_int(const char* text, int32_t* result) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_convert_short(const char* text, int16_t* result) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_convert_double(const char* text, double* result) TEVPF_NOEXCEPT;

/* Formats a value as text.
 *   format       a printf format for one argument (int, double or text by type), or null for %d, %g
 *                and %s
 *   destination  the caller's buffer, large enough for the text and its terminator
 *   length_out   characters written, without the terminator */
TEVPF_API TEVPF_STATUS TEV8R1_to_char(int32_t type, const char* format, const void* value,
                                      char* destination, int32_t* length_out) TEVPF_NOEXCEPT;

/* Compares two values of a type: (TEVPF_STATUS)-1 a is smaller, 1 a is greater, PF_NORMAL equal.
 * Reals and doubles are equal within the tolerance; a string b whose first "*" is its last
 * character equals every text that starts with what stands before it. */
TEVPF_API TEVPF_STATUS TEV8R1_compare(int32_t type, const void* a, const void* b,
                                      double tolerance) TEVPF_NOEXCEPT;

/* The comparison of strings on its own; bytes count as unsigned. */
TEVPF_API TEVPF_STATUS TEV8R1_string_compare(const char* text, const char* pattern) TEVPF_NOEXCEPT;

/* ---- Lists: parameters ----------------------------------------------------------------------
 * Every operation that names a list, here and in the next two groups: PF_NOFILE, PF_NOELEM (no such
 * list). Where a parameter is named: PF_NOPARAM. A name whose first "*" is its last character finds
 * the first parameter, in name order, that starts with what stands before it. Positions count from
 * 0. Costs of finding: see the top. */

/* Adds a parameter in front of the one at `position` (PF_END_POS, or any position behind the last:
 * at the end; negative: at the front). str.length is ignored, a null str.value is the empty text.
 * O(n) moves of index entries; at the end no record moves.
 *   PF_DUPLICATE  the list has that name
 *   PF_BADNAME    the name starts with a blank
 *   PF_BADTYPE    no such value type
 *   PF_BADRANGE   max below min
 *   PF_RANGE      value outside min..max
 *   PF_BADPREC    precision below 1 (reals and doubles)
 * A refusal may leave more spare slots than before, nothing else. */
TEVPF_API TEVPF_STATUS TEV8R1_PF_add_param(const char* list_name, const TEVPF_PARAM_DEF* definition,
                                           int32_t position) TEVPF_NOEXCEPT;

/* Deletes a parameter. O(n). The cursor is a position: it is not adjusted. */
TEVPF_API TEVPF_STATUS TEV8R1_PF_delete_param(const char* list_name,
                                              const char* param_name) TEVPF_NOEXCEPT;

/* Replaces everything but the name of the parameter that definition.name selects. The
 * str fields are read as for adding. O(length of the texts).
 *   PF_BADNAME, PF_BADTYPE, PF_BADRANGE, PF_RANGE, PF_BADPREC as for adding */
TEVPF_API TEVPF_STATUS TEV8R1_PF_modify_param_def(const char* list_name,
                                                  TEVPF_PARAM_DEF definition) TEVPF_NOEXCEPT;

/* Renames a parameter; the new name is cut to 19 characters and not checked for a blank. O(n).
 *   PF_DUPLICATE  another parameter has the new name */
TEVPF_API TEVPF_STATUS TEV8R1_PF_modify_param_name(const char* list_name, const char* old_name,
                                                   const char* new_name) TEVPF_NOEXCEPT;

/* Moves a parameter so that it stands at new_position (PF_END_POS: last). O(n). The cursor is not
 * adjusted.
 *   PF_BADPOS  new_position outside 0..n-1 */
TEVPF_API TEVPF_STATUS TEV8R1_PF_move_param(const char* list_name, const char* param_name,
                                            int32_t new_position) TEVPF_NOEXCEPT;

/* btf += stored size of new_type's part - that of old_type's. Always PF_NORMAL. */
TEVPF_API TEVPF_STATUS TEV8R1_adjust_param_size_btf(int32_t old_type, int32_t new_type,
                                                    int32_t* btf) TEVPF_NOEXCEPT;

/* The bytes a parameter takes in the file.
 *   description  or null
 *   length       of a string's value, without terminator; not looked at for numbers
 *   PF_BADTYPE  no such value type */
TEVPF_API TEVPF_STATUS TEV8R1_calc_param_bytes(int32_t type, const char* description,
                                               int32_t length, int32_t* bytes_out) TEVPF_NOEXCEPT;

/* ---- Lists: values and defaults ------------------------------------------------------------- */

/* Changes a value within its bounds (inclusive, exact). The cursor does not move.
 *   value  int32_t, float, text, double or int16_t, by the parameter's type
 *   PF_BADRANGE  the parameter's own max is below its min
 *   PF_RANGE     outside the bounds */
TEVPF_API TEVPF_STATUS TEV8R1_PF_modify_param(const char* list_name, const char* param_name,
                                              const void* value) TEVPF_NOEXCEPT;

/* Copies a value and makes its parameter the current one.
 *   value_out  storage of the value size that TEV8R1_PF_inq_param_size reports */
TEVPF_API TEVPF_STATUS TEV8R1_PF_get_param_value(const char* list_name, const char* param_name,
                                                 void* value_out) TEVPF_NOEXCEPT;

/* Copies the value out of a definition (strings with terminator).
 *   PF_BADTYPE  no such value type */
TEVPF_API TEVPF_STATUS TEV8R1_load_param_value(const TEVPF_PARAM_DEF* definition,
                                               void* value_out) TEVPF_NOEXCEPT;

/* Sets a definition's value from text; the type is the argument's, definition->type is not read. A
 * string value becomes a new block that the caller owns (free); str.length is not touched.
 *   PF_BADARG, PF_RANGE, PF_BADTYPE as TEV8R1_from_char */
TEVPF_API TEVPF_STATUS TEV8R1_store_param_value(int32_t type, const char* text,
                                                TEVPF_PARAM_DEF* definition) TEVPF_NOEXCEPT;

/* The list's default definition of a type. Its description and string value, when present, are new
 * blocks that the caller owns (free).
 *   PF_BADTYPE  no such value type */
TEVPF_API TEVPF_STATUS TEV8R1_PF_inq_param_dft(const char* list_name, int32_t type,
                                               TEVPF_PARAM_DEF* definition_out) TEVPF_NOEXCEPT;

/* Replaces the list's default definition of definition.type. Kept in memory only. A null str.value
 * is the empty text; str.length is kept as given.
 *   PF_BADNAME, PF_BADTYPE, PF_BADRANGE, PF_RANGE, PF_BADPREC as for adding a parameter */
TEVPF_API TEVPF_STATUS TEV8R1_PF_set_param_dft(const char* list_name,
                                               TEVPF_PARAM_DEF definition) TEVPF_NOEXCEPT;

/* A new table of the five initial default definitions, in type order. The caller owns it and the
 * text in the string definition (free both). */
TEVPF_API TEVPF_STATUS TEV8R1_load_param_dft(TEVPF_PARAM_DEF** table_out) TEVPF_NOEXCEPT;

/* ---- Lists: traversal and inquiry -----------------------------------------------------------
 * Each list has a cursor: the position of its current parameter, -1 before the first.
 * Definitions go into the caller's record: before the call, description points to a buffer of the
 * description size and, for a string parameter, part.str.value to one of the value size, both as
 * the size inquiries report them (at least 1: the empty text). The two pointers stay; everything
 * else is overwritten. */

/* Name and value of the next parameter. The cursor advances, at the end too, so that a step back
 * then delivers the last one.
 *   name_out   at least TEVPF_NAME_SIZE bytes
 *   value_out  storage of the value size that TEV8R1_PF_inq_next_param_size reports
 *   PF_NOMORE  there is no next parameter */
TEVPF_API TEVPF_STATUS TEV8R1_PF_get_next_param(const char* list_name, char* name_out,
                                                void* value_out) TEVPF_NOEXCEPT;

/* Definition of the next (previous) parameter; it becomes current.
 *   PF_NOMORE  there is none; the cursor stays */
TEVPF_API TEVPF_STATUS TEV8R1_PF_get_next_param_def(const char* list_name,
                                                    TEVPF_PARAM_DEF* definition) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_PF_get_prev_param_def(const char* list_name,
                                                    TEVPF_PARAM_DEF* definition) TEVPF_NOEXCEPT;

/* Definition of the named parameter, or of the one at a position; it becomes current.
 *   PF_BADPOS  position outside 0..n-1 */
TEVPF_API TEVPF_STATUS TEV8R1_PF_get_param_def(const char* list_name, const char* param_name,
                                               TEVPF_PARAM_DEF* definition) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_PF_get_param_def_by_pos(const char* list_name, int32_t position,
                                                      TEVPF_PARAM_DEF* definition) TEVPF_NOEXCEPT;

/* Type and buffer sizes (terminators included) of the named parameter, of the one at a position, or
 * of the next one. The cursor stays.
 *   PF_BADPOS  position outside 0..n-1
 *   PF_NOMORE  there is no next parameter */
TEVPF_API TEVPF_STATUS TEV8R1_PF_inq_param_size(const char* list_name, const char* param_name,
                                                int32_t* type_out, int32_t* value_size_out,
                                                int32_t* desc_size_out) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_PF_inq_param_size_by_pos(const char* list_name, int32_t position,
                                                       int32_t* type_out, int32_t* value_size_out,
                                                       int32_t* desc_size_out) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_PF_inq_next_param_size(const char* list_name, int32_t* type_out,
                                                     int32_t* value_size_out,
                                                     int32_t* desc_size_out) TEVPF_NOEXCEPT;

/* The number of parameters. */
TEVPF_API TEVPF_STATUS TEV8R1_PF_inq_num_params(const char* list_name,
                                                int32_t* count_out) TEVPF_NOEXCEPT;

/* Puts the cursor before the first parameter. */
TEVPF_API TEVPF_STATUS TEV8R1_PF_reset_param(const char* list_name) TEVPF_NOEXCEPT;

/* Puts the cursor on a position.
 *   PF_BADPOS  position outside 0..n-1 */
TEVPF_API TEVPF_STATUS TEV8R1_set_cur_param(const char* list_name, int32_t position) TEVPF_NOEXCEPT;

/* Position, existence (PF_NORMAL or PF_NOPARAM) and type of a parameter. */
TEVPF_API TEVPF_STATUS TEV8R1_inq_param_pos(const char* list_name, const char* param_name,
                                            int32_t* position_out) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_inq_param_exists(const char* list_name,
                                               const char* param_name) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_get_param_type(const char* list_name, const char* param_name,
                                             int32_t* type_out) TEVPF_NOEXCEPT;

/* Switches interactive mode on, for all tables, when the list exists: rows are then stored without
 * value checks. */
TEVPF_API TEVPF_STATUS TEV8R1_set_interactive_list(const char* list_name) TEVPF_NOEXCEPT;

/* ---- Tables: columns ------------------------------------------------------------------------
 * Every operation: PF_NOFILE, PF_NOELEM (no such table). Where a column is named: PF_NOCOLUMN.
 * Column names are matched exactly. */

/* Appends a column; existing rows get its min, strings the empty text. O(rows).
 *   PF_BADNAME    the name starts with a blank
 *   PF_DUPLICATE  the table has that column
 *   PF_BADUNIQUE  indexed and unique, but the table has rows
 *   PF_BADTYPE    no such value type
 *   PF_BADRANGE   max below min
 *   PF_BADPREC    precision below 1 (reals and doubles)
 *   PF_BADWIDTH   width below 1, or the row would grow beyond 2^31 - 1 bytes */
TEVPF_API TEVPF_STATUS TEV8R1_PF_def_column(const char* table_name,
                                            TEVPF_COL_DEF definition) TEVPF_NOEXCEPT;

/* Replaces a column's definition, its name included. The default row gets the minimums again.
 * O(rows) for the checks, O(rows log rows) when an index is switched on.
 *   PF_BADNAME, PF_DUPLICATE, PF_BADTYPE, PF_BADRANGE, PF_BADPREC, PF_BADWIDTH as above
 *   PF_TYPECHG    another type, but the table has rows
 *   PF_RANGE      a row holds a value outside the new bounds
 *   PF_BADCOLCHG  another string width, but the table has rows
 *   PF_NOTUNIQUE  unique, but two rows hold the same value */
TEVPF_API TEVPF_STATUS TEV8R1_PF_modify_col_def(const char* table_name, const char* column_name,
                                                TEVPF_COL_DEF definition) TEVPF_NOEXCEPT;

/* Deletes a column; with the last one all rows go. O(rows). */
TEVPF_API TEVPF_STATUS TEV8R1_PF_delete_col(const char* table_name,
                                            const char* column_name) TEVPF_NOEXCEPT;

/* Moves a column in front of another one, or to the end when before_name is null. O(rows). */
TEVPF_API TEVPF_STATUS TEV8R1_PF_move_col(const char* table_name, const char* column_name,
                                          const char* before_name) TEVPF_NOEXCEPT;

/* A column's definition, by name or by position in column order; its description, when present, is
 * a new block that the caller owns (free). On PF_NOMEM the rest of def_out is written and its
 * description is null.
 *   PF_BADPOS  pos outside 0..columns-1 */
TEVPF_API TEVPF_STATUS TEV8R1_PF_inq_col_def(const char* table_name, const char* column_name,
                                             TEVPF_COL_DEF* def_out) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_PF_inq_col_def_by_pos(const char* table_name, int32_t pos,
                                                    TEVPF_COL_DEF* def_out) TEVPF_NOEXCEPT;

/* Names, and byte offsets within a row, of all columns in column order: new arrays that the caller
 * owns (free); without columns the count is 0 and the array pointer is not written. O(columns). */
TEVPF_API TEVPF_STATUS TEV8R1_PF_inq_col_names(const char* table_name, int32_t* count_out,
                                               char (**names_out)[TEVPF_NAME_SIZE]) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_PF_inq_col_offsets(const char* table_name, int32_t* count_out,
                                                 int32_t** offsets_out) TEVPF_NOEXCEPT;

/* The table's template of a value type: sensible starting definitions for callers that define
 * columns. Kept in memory only; the library does not use them. A description in def_out is a new
 * block that the caller owns (free).
 *   PF_BADTYPE  no such value type */
TEVPF_API TEVPF_STATUS TEV8R1_PF_set_col_dft(const char* table_name,
                                             TEVPF_COL_DEF def) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_PF_inq_col_dft(const char* table_name, int32_t type,
                                             TEVPF_COL_DEF* def_out) TEVPF_NOEXCEPT;

/* The value type of a column. */
TEVPF_API TEVPF_STATUS TEV8R1_get_col_type(const char* table_name, const char* column_name,
                                           int32_t* type_out) TEVPF_NOEXCEPT;

/* PF_NORMAL when the definition's bounds and precision are in order, else PF_BADRANGE, PF_BADPREC
 * or PF_BADTYPE. */
TEVPF_API TEVPF_STATUS TEV8R1_validate_col_range(const TEVPF_COL_DEF* definition) TEVPF_NOEXCEPT;

/* The bytes a column takes in the file.
 *   PF_BADTYPE  no such value type */
TEVPF_API TEVPF_STATUS TEV8R1_calc_col_bytes(int32_t type, const char* description,
                                             int32_t* bytes_out) TEVPF_NOEXCEPT;

/* The larger of a column's width and the length of its name: its display width. Not a status. */
TEVPF_API int32_t TEV8R1_calc_col_width(int32_t width, int32_t name_length) TEVPF_NOEXCEPT;

/* ---- Tables: rows ---------------------------------------------------------------------------
 * Every operation: PF_NOFILE, PF_NOELEM (no such table).
 * A row is row_wid bytes, each column's value at its offset. Row numbers count rows as they are
 * stored; positions count them as they are traversed: the same, unless a search column is set,
 * whose order positions then follow. The cursor (current row, next row) holds positions.
 * Value checks: PF_RANGE (a value outside its column's bounds, give or take the column's
 * tolerance) and PF_DUPLICATE (a unique column already holds it); interactive mode switches them
 * off where said. Adding and deleting cost O(log n) comparisons and O(n) moves of entries per
 * index, and O(n) moves of rows; appending moves no row, and no entry where its value is the
 * greatest. */

/* Appends a row; inserts it in front of a row number (PF_END_POS or beyond the last: at the end;
 * negative: at the front); or appends it after filling every column whose entry in `supplied` is 0
 * from the default row, in the caller's buffer. The cursor stays. Refused by the value checks
 * unless interactive mode is on; spare slots that were made stay. */
TEVPF_API TEVPF_STATUS TEV8R1_PF_add_row(const char* table_name, const void* row) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_PF_add_row_by_pos(const char* table_name, const void* row,
                                                int32_t row_number) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_PF_add_row_with_dft(const char* table_name, void* row,
                                                  const int32_t* supplied) TEVPF_NOEXCEPT;

/* Replaces the current row; values are always checked, its own unique values are no duplicates.
 * O(log n) comparisons and O(n) moves of entries for each index whose value changes.
 *   PF_NOCURROW  no row is current */
TEVPF_API TEVPF_STATUS TEV8R1_PF_replace_row(const char* table_name,
                                             const void* row) TEVPF_NOEXCEPT;

/* Deletes the current row. Afterwards no row is current; the next one to be delivered is the row
 * that followed.
 *   PF_NOCURROW  no row is current */
TEVPF_API TEVPF_STATUS TEV8R1_PF_delete_row(const char* table_name) TEVPF_NOEXCEPT;

/* Moves row number `from` so that it becomes row number `to` (or the last). The cursor stays.
 * O(n).
 *   PF_SEARCHSET  a search column is set
 *   PF_BADPOS     no such row, or fewer than two rows
 *   PF_RANGE, PF_DUPLICATE  the row does not pass the value checks; it stays where it was */
TEVPF_API TEVPF_STATUS TEV8R1_PF_move_row(const char* table_name, int32_t from,
                                          int32_t to) TEVPF_NOEXCEPT;

/* Copies the row at the next position, or at a position, to row_out (row_wid bytes) and makes it
 * current. O(1).
 *   PF_NOMORE  there is no next row
 *   PF_BADPOS  pos outside 0..rows-1 */
TEVPF_API TEVPF_STATUS TEV8R1_PF_get_next_row(const char* table_name, void* row_out) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_PF_get_row_by_pos(const char* table_name, int32_t pos,
                                                void* row_out) TEVPF_NOEXCEPT;

/* Puts the cursor before the first row. */
TEVPF_API TEVPF_STATUS TEV8R1_PF_reset_table(const char* table_name) TEVPF_NOEXCEPT;

/* Sets and reads the default row (row_wid bytes; kept in memory only). Setting checks values unless
 * interactive mode is on; duplicates are allowed. */
TEVPF_API TEVPF_STATUS TEV8R1_PF_set_dft_row(const char* table_name,
                                             const void* row) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_PF_inq_dft_row(const char* table_name, void* row_out) TEVPF_NOEXCEPT;

/* Copies one column's values of all rows, in storage order, one behind the other. O(n).
 *   values_out  rows * value size bytes
 *   PF_NOMORE    the table has no rows
 *   PF_NOCOLUMN  no such column */
TEVPF_API TEVPF_STATUS TEV8R1_PF_get_col_values(const char* table_name, const char* column_name,
                                                void* values_out) TEVPF_NOEXCEPT;

/* The number of rows; and all figures of a table: columns, rows, bytes per row, characters of a
 * formatted row (0 until a report made the formats), position of the current row (-1: none). */
TEVPF_API TEVPF_STATUS TEV8R1_PF_inq_num_rows(const char* table_name,
                                              int32_t* num_rows_out) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_PF_inq_table_info(const char* table_name, int32_t* num_cols_out,
                                                int32_t* num_rows_out, int32_t* row_wid_out,
                                                int32_t* dsp_wid_out,
                                                int32_t* cur_row_out) TEVPF_NOEXCEPT;

/* Checks one value against one column, in every mode. O(log n) for a unique column.
 *   PF_NOCOLUMN  no such column; PF_RANGE, PF_DUPLICATE: the value checks */
TEVPF_API TEVPF_STATUS TEV8R1_validate_row_value(const char* table_name, const char* column_name,
                                                 const void* value) TEVPF_NOEXCEPT;

/* Switches interactive mode on, for all tables, when the table exists; and off. */
TEVPF_API TEVPF_STATUS TEV8R1_set_interactive_table(const char* table_name) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_turn_off_interactive(void) TEVPF_NOEXCEPT;

/* ---- Tables: search ------------------------------------------------------------------------- */

/* Sets the search column, or removes it when column_name is null. The cursor stays.
 *   PF_NOCOLUMN   no such column
 *   PF_BADSEARCH  it has no index; the search column stays as it was */
TEVPF_API TEVPF_STATUS TEV8R1_PF_define_table_search(const char* table_name,
                                                     const char* column_name) TEVPF_NOEXCEPT;

/* Searches from the next position on for a row whose column holds the key, copies it to row_out
 * (row_wid bytes) and makes it current. O(log n) in the search column, else O(n).
 * A column of numbers that is searched often without a change of rows in between gets a copy of its
 * values, which the next searches go through faster: the search column after 4,096 searches (n / 256
 * beyond a million rows), a column without index when searches have looked at a million rows (n,
 * beyond). The copy takes O(n) once and a value's size a row, and goes with the next change.
 *   mode  1: in the search column, take the next greater value when there is no equal one
 *   key   binary value of the column's type; a text may end in "*" and then finds what it starts
 *   PF_NOTFOUND  no such row; the cursor stays
 *   PF_NOCOLUMN  no such column */
TEVPF_API TEVPF_STATUS TEV8R1_PF_get_row_by_value(const char* table_name, int8_t mode,
                                                  const char* column_name, const void* key,
                                                  void* row_out) TEVPF_NOEXCEPT;

/* Copies the value that the named column has in the first row whose first column holds the key. The
 * cursor is the same afterwards. A table without columns: PF_NORMAL, nothing is written.
 * O(log n) when the first column is the search column, else O(n); copies values like the operation
 * above.
 *   value_out  storage of the column's value size
 *   PF_NOTFOUND  no such row; PF_NOCOLUMN  no such column */
TEVPF_API TEVPF_STATUS TEV8R1_PF_get_value(const char* table_name, const char* column_name,
                                           const void* key, void* value_out) TEVPF_NOEXCEPT;

/* The row number at a position; not a status. -1 when the table is not found; a position outside
 * the table gives the position. */
TEVPF_API int32_t TEV8R1_convert_row(const char* table_name, int32_t pos) TEVPF_NOEXCEPT;

/* ---- Reports --------------------------------------------------------------------------------
 * Text files for people to read, created or emptied. Write errors are not reported. In them, "@"
 * stands for a field without a value, "\0" for the end of a text that is empty or ends in a blank;
 * a backslash at the end of a line says that the next one goes on; INT, SHT, REAL, DBL and STG are
 * the value types.
 *   PF_OPENFAIL  the path cannot be written
 *   PF_NOFILE, PF_NOELEM  as above; the text file is then there and empty */

/* The whole current file. Without a file, PF_NOFILE and no text file. O(file size). */
TEVPF_API TEVPF_STATUS TEV8R1_PF_dump_file(const char* path) TEVPF_NOEXCEPT;

/* One list; one table with all columns and rows in storage order. O(n). */
TEVPF_API TEVPF_STATUS TEV8R1_PF_dump_list(const char* name, const char* path) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_PF_dump_table(const char* name, const char* path) TEVPF_NOEXCEPT;

/* Chosen columns and rows of a table, in traversal order. O(the rows shown).
 *   definitions   not 0: show the definitions of the columns
 *   count, names  the columns, as an array of 20-byte names; a count above the number of columns
 *                 shows all of them and names is not read
 *   first, last   positions, inclusive; PF_END_POS or beyond the last row: to the last row
 *   PF_BADARG    count below 1
 *   PF_NOCOLUMN  no such column; nothing is written */
TEVPF_API TEVPF_STATUS TEV8R1_PF_print_table(const char* table_name, const char* path,
                                             int32_t definitions, int32_t count,
                                             const char (*names)[TEVPF_NAME_SIZE], int32_t first,
                                             int32_t last) TEVPF_NOEXCEPT;

/* Rewrites backspace, tab, newline, vertical tab, form feed, carriage return and backslash as \b \t
 * \n \v \f \r and \\.
 *   size    in and out: bytes of the block
 *   buffer  in and out: the block, from malloc; it is reallocated when it must grow */
TEVPF_API TEVPF_STATUS TEV8R1_remove_escape_chars(int32_t* size, char** buffer) TEVPF_NOEXCEPT;

/* Reads such sequences, and a backslash with one to three octal digits, back into characters, in
 * place. Always PF_NORMAL.
 *   length_out  length of the rewritten text, which may hold NUL characters */
TEVPF_API TEVPF_STATUS TEV8R1_insert_escape_chars(char* text, int32_t* length_out) TEVPF_NOEXCEPT;

/* Builds the heading of columns first..last (positions in column order) of a table. O(columns).
 *   gap         blanks between neighbours
 *   fill_width  blanks the buffer gets first
 *   first_lead  receives the blanks in front of the first name
 *   buffer      room for fill_width and for all display widths and gaps, and a terminator */
TEVPF_API TEVPF_STATUS TEV8R1_create_table_header(const char* table_name, int32_t first,
                                                  int32_t last, int32_t gap, int32_t fill_width,
                                                  int32_t* first_lead, char* buffer) TEVPF_NOEXCEPT;

/* ---- Building blocks ------------------------------------------------------------------------
 * What the library is made of and exports as well. */

/* Copies count bytes; ranges may overlap. Note the order of arguments. Always PF_NORMAL. */
TEVPF_API TEVPF_STATUS TEV8R1_memcpy(int32_t count, const void* source,
                                     void* destination) TEVPF_NOEXCEPT;

/* A new heap copy of a text that the caller owns (free), or null without memory. Not a status. */
TEVPF_API char* TEV8R1_strdup(const char* text) TEVPF_NOEXCEPT;

/* Grows an array by `increment` entries of `size` bytes. count 0: a new zeroed block (the old
 * pointer is not looked at); otherwise the block is resized, the added bytes are not zeroed.
 *   array          in and out: the block, from malloc
 *   first_new_out  the first byte behind the count existing entries
 *   PF_NOMEM  the block stays as it was */
TEVPF_API TEVPF_STATUS TEV8R1_allocate_elem(int32_t count, int32_t increment, int32_t size,
                                            void** array, void** first_new_out) TEVPF_NOEXCEPT;

/* Inserts value into an array of count entries with room for one more; a position outside 0..count
 * inserts nothing. Always PF_NORMAL. O(count). */
TEVPF_API TEVPF_STATUS TEV8R1_insert_index_value(int32_t* array, int32_t count, int32_t position,
                                                 int32_t value) TEVPF_NOEXCEPT;

/* Removes a row number from an index of count entries and lowers every greater one by 1. Always
 * PF_NORMAL. O(count). */
TEVPF_API TEVPF_STATUS TEV8R1_remove_index(int32_t* index, int32_t row_number,
                                           int32_t count) TEVPF_NOEXCEPT;

/* Searches an index for a key.
 * O(log count); for reals and doubles also one step for each equal entry.
 *   column_base  the column's value in row number 0; row number e has it e * row_wid bytes further
 *                on
 *   pos_out      PF_NORMAL: the first equal entry. PF_NOTFOUND: where the key would be inserted
 *   PF_CMPFAIL  no such value type; pos_out is untouched */
TEVPF_API TEVPF_STATUS TEV8R1_binary_search(int32_t type, double tolerance, int32_t count,
                                            int32_t row_wid, const int32_t* index,
                                            const void* column_base, const void* key,
                                            int32_t* pos_out) TEVPF_NOEXCEPT;

/* The comparison of two index entries that the last TEV8R1_create_index used: negative, 0,
 * positive. Fit for qsort; a and b point to int32_t row numbers. */
TEVPF_API int32_t TEV8R1_sort_comp(const void* a, const void* b) TEVPF_NOEXCEPT;

/* A new index of num_rows entries 0, 1, 2 ... with room for num_rows + free_rows; the caller owns
 * it (free). Without room to make, PF_NORMAL and null. O(num_rows). */
TEVPF_API TEVPF_STATUS TEV8R1_adjust_index(int32_t num_rows, int16_t free_rows,
                                           int32_t** idx_out) TEVPF_NOEXCEPT;

/* Grows a default row to row_wid bytes (a null one is made) and puts the definition's min, or the
 * empty text, at offset.
 *   dft_row  in and out: the row, from malloc
 *   size     bytes of the column's value */
TEVPF_API TEVPF_STATUS TEV8R1_adjust_default(void** dft_row, int32_t row_wid,
                                             const TEVPF_COL_DEF* definition, int32_t size,
                                             int32_t offset) TEVPF_NOEXCEPT;

#ifdef __cplusplus
}
#endif

#endif
