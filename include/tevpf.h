/* libtevpf: named technical parameters and tables in binary parameter files.
 *
 * A parameter file holds lists (ordered, named, typed parameters with bounds, units, precision and
 * description) and tables (typed columns over rows of fixed width). Opening a file reads all of it
 * into memory, and saving writes all of it. Between the two, every operation works in memory.
 *
 * Conventions
 *   Statuses   Every operation returns a TEVPF_STATUS unless its comment says otherwise. Compare it
 *              for equality with the names below. PF_NORMAL is success; PF_NEWFILE and PF_NOMORE
 *              are results. The comment at the head of a group lists the "not found" statuses of
 *              all its operations.
 *   Texts      Texts are bytes that end in a zero byte. A text argument is never null unless the
 *              comment says "or null". The library copies texts and keeps no pointer of the caller.
 *   Lengths    All lengths and sizes are bytes. Names of elements, parameters and columns have at
 *              most 19 bytes; a longer name is cut when it is stored (in UTF-8 possibly inside a
 *              character), and finds nothing when it is looked up. Units have at most 7 bytes and
 *              descriptions of elements 79; they are cut in the same way.
 *   Buffers    Results are written to the caller's storage, whose size the comment states. Blocks
 *              that an operation hands out come from malloc, and the caller releases them with free
 *              of the same C runtime. A failure does not write out-arguments unless the comment
 *              says otherwise.
 *   Refusals   An operation checks first and changes afterwards. When it fails, its list, table or
 *              file is as it was, unless the comment says what stays. Every operation that
 *              allocates can return PF_NOMEM.
 *   Threads    All state (open files, current file, settings) is shared by the whole process and is
 *              not locked. Use the library from one thread at a time.
 *   Costs      n is the number of parameters, rows or elements that the operation works on. An
 *              operation whose comment states no cost takes O(1). Finding what is named comes on
 *              top: an element takes O(1), a column O(columns), a parameter O(1) by its exact name
 *              and O(log n) by a pattern. The first n / 16 look-ups by exact name in a list also take
 *              O(log n).
 *
 * This header declares the operations that programs need. The library also exports its internal
 * operations on records; the headers beside their sources declare them and are not installed.
 *
 * C99 and C++. Little-endian hosts only. */
#ifndef TEVPF_H
#define TEVPF_H

#include <stdint.h>

#define TEVPF_VERSION_MAJOR 1
#define TEVPF_VERSION_MINOR 0
#define TEVPF_VERSION_PATCH 0

/* TEVPF_API sets the linkage of the operations:
 *   building the shared library   TEVPF_BUILD defined    exported
 *   using the shared library      neither defined        imported (matters on Windows)
 *   building the static library   TEVPF_STATIC defined   plain
 *   using the static library      TEVPF_STATIC defined   plain; CMake's target tevpf::tevpf_static
 *                                 and the pkg-config file's --static flags define it */
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
#define PF_NOTEXACT ((TEVPF_STATUS)0x09608023u)  /* internal: a search took a greater value */
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
#define PF_BADCOLCHG ((TEVPF_STATUS)0x096080C2u) /* a string width is fixed once there are rows */
#define PF_BADARG ((TEVPF_STATUS)0x096080D2u)    /* an invalid argument, or text not a number */
#define PF_BADWIDTH ((TEVPF_STATUS)0x096080DAu)  /* a column's width is less than 1, or too large */
#define PF_BADPREC ((TEVPF_STATUS)0x096080E2u)   /* a precision is less than 1 */
#define PF_NOPRIV ((TEVPF_STATUS)0x096080EAu)    /* the file may not be written */
#define PF_BADNAME ((TEVPF_STATUS)0x096080F2u)   /* a name starts with a blank */
#define PF_BADFILE ((TEVPF_STATUS)0x096080FAu)   /* not a parameter file; it was closed again */
#define PF_BADUNIQUE ((TEVPF_STATUS)0x09608102u) /* no new unique column once there are rows */
#define PF_BADRANGE ((TEVPF_STATUS)0x0960810Au)  /* a maximum is less than its minimum */
#define PF_TYPECHG ((TEVPF_STATUS)0x09608112u)   /* a column with rows cannot change its type */
#define PF_SEARCHSET ((TEVPF_STATUS)0x0960811Au) /* rows cannot move while a search column is set */

/* ---- Codes, sizes and records --------------------------------------------------------------- */

#define PF_ELEM_LIST 1
#define PF_ELEM_TABLE 2

#define PF_TYPE_INT 11    /* int32_t */
#define PF_TYPE_REAL 12   /* float */
#define PF_TYPE_STRING 13 /* zero-terminated text; in a row: width + 1 bytes */
#define PF_TYPE_DOUBLE 14 /* double */
#define PF_TYPE_SHORT 15  /* int16_t */

#define PF_END_POS 0x7FFFFFFF /* position argument: at the end */

#define TEVPF_NAME_SIZE 20       /* names, terminator included */
#define TEVPF_UNITS_SIZE 8       /* units, terminator included */
#define TEVPF_DESC_SIZE 80       /* element descriptions, terminator included */
#define TEVPF_FILE_NAME_SIZE 258 /* names of open files, terminator included */

#pragma pack(push, 4)

/* Definition of one parameter. `type` decides which member of `part` is used. */
typedef struct TEVPF_PARAM_DEF {
  int32_t type; /* PF_TYPE_... */
  char name[TEVPF_NAME_SIZE];
  char units[TEVPF_UNITS_SIZE];
  char* description; /* null: none */
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
      double value, max, min; /* aligned to 4 bytes: copy, do not point at them */
    } f64;                    /* PF_TYPE_DOUBLE */
    struct {
      int16_t value, max, min;
    } i16; /* PF_TYPE_SHORT */
  } part;
} TEVPF_PARAM_DEF;

/* Definition of one column. `type` decides which member of `limits` is used; strings have none.
 *
 * Equality of reals and doubles has an absolute tolerance: values of the column are equal if they
 * differ by at most 10^-(precision + 1). Searches, unique columns, bounds and "has this value
 * changed?" all use it. Warning: the tolerance does not shrink with the values. At precision 6,
 * capacitances of 2e-9 and 5e-9 farads are equal: a unique column refuses the second, and a search
 * for one finds the other. For small values in SI units, choose a larger precision (here 12), or a
 * smaller unit. */
typedef struct TEVPF_COL_DEF {
  char* description; /* null: none */
  uint32_t spare;    /* copied with the definition, never interpreted or stored */
  int32_t type;      /* PF_TYPE_... */
  char name[TEVPF_NAME_SIZE];
  char units[TEVPF_UNITS_SIZE];
  int8_t desc_byte;  /* ignored; delivered as 0 */
  int8_t spare_byte; /* never interpreted */
  int8_t idx_flag;   /* 1: the column has an index */
  int8_t unq_flag;   /* 1: no two rows hold the same value; 0 is stored if idx_flag is 0 */
  int32_t width;     /* display width; strings: also the largest text length */
  union {
    struct {
      int32_t max, min;
    } i32; /* PF_TYPE_INT */
    struct {
      float max, min;
      int32_t precision; /* significant digits shown; sets the tolerance: see the warning above */
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

/* Initialises the library. Call it once, before anything else: the first call forgets files that
 * are already open, without writing or closing them. It reads the environment variable
 * TEV8R1_debug. If that is defined, even as the empty text, dumps show internal fields, and moving
 * a column prints the new offsets to standard output. Without this call the library works with
 * debug output off.
 *   PF_INITDONE  already initialised: files stay open, TEV8R1_debug was read again */
TEVPF_API TEVPF_STATUS TEV8R1_PF_init(void) TEVPF_NOEXCEPT;

/* Opens a parameter file and makes it current. A missing file is created, empty and exclusively: if
 * another process creates it at the same time, that file is opened. A file that may be written but
 * not read counts as missing and is emptied. O(file size).
 *   name  path, on Windows in UTF-8. A leading "$NAME", up to the first "/", is replaced by the value
 *         of the environment variable "$NAME", whose name includes the "$". The result has at most
 *         257 bytes and is the file's name from then on.
 *   PF_NEWFILE    open, new and empty. If the file is closed without having been saved, it is
 *                 removed, provided that the name still stands for the file that was created
 *   PF_FILEOPEN   already open under this name; the current file stays current
 *   PF_OPENFAIL   cannot be opened, created or read, not a regular file (pipe, folder), undefined
 *                 "$" variable, or name too long
 *   PF_BADFILE    not a parameter file; it was closed again, and the current file is the one that
 *                 TEV8R1_PF_close makes current
 *   PF_BADFORMAT, PF_BADTYPE, PF_DUPLICATE
 *                 loading stopped part-way: the file is open and current with what was loaded
 *   PF_NOMEM      the same; or memory ran out before the file was opened, and the current file
 *                 stays current */
TEVPF_API TEVPF_STATUS TEV8R1_PF_open(const char* name) TEVPF_NOEXCEPT;

/* Makes an open file current.
 *   name       the file's name, with a leading "$NAME" already replaced
 *   PF_NOFILE  no file is open under this name */
TEVPF_API TEVPF_STATUS TEV8R1_PF_change_file(const char* name) TEVPF_NOEXCEPT;

/* Copies the current file's name.
 *   name_out  at least TEVPF_FILE_NAME_SIZE bytes */
TEVPF_API TEVPF_STATUS TEV8R1_PF_inq_current_file(char* name_out) TEVPF_NOEXCEPT;

/* Sets *access_out to 1 if the current file may be written, to 0 if it could only be opened for
 * reading. */
TEVPF_API TEVPF_STATUS TEV8R1_PF_inq_file_access(int32_t* access_out) TEVPF_NOEXCEPT;

/* Delivers the names and descriptions of the current file's elements, in directory order. O(n).
 *   file_name_out  at least TEVPF_FILE_NAME_SIZE bytes
 *   ..._out        receive new arrays of 20-byte names and 80-byte descriptions that the caller
 *                  owns (free); not written if their count is 0
 *   PF_NOMEM  arrays handed out before the failure belong to the caller */
TEVPF_API TEVPF_STATUS TEV8R1_PF_inq_file_elements(
    char* file_name_out, int32_t* num_lists_out, char (**list_names_out)[TEVPF_NAME_SIZE],
    char (**list_descs_out)[TEVPF_DESC_SIZE], int32_t* num_tables_out,
    char (**table_names_out)[TEVPF_NAME_SIZE],
    char (**table_descs_out)[TEVPF_DESC_SIZE]) TEVPF_NOEXCEPT;

/* Writes the current file: in place, or as a copy to another path. The copy is not opened, and the
 * current file counts as unsaved afterwards if it did before. O(file size).
 *
 * Either way the new content is written to a file beside the old one, flushed to the disk, and put
 * in the old one's place in one step. Where the system does not allow that (see
 * docs/robustness.md), the old file is emptied and written again.
 *   path         null or the file's own name: in place. Any other path is taken literally
 *   PF_NOPRIV    the file is read-only, or the system refuses access to the path
 *   PF_OPENFAIL  the path cannot be opened, or not everything could be written or flushed. The file
 *                in memory is unchanged and can be saved again. The file on the disk is the
 *                complete old one (or the complete new one, if only the flush of the folder
 *                failed), or possibly a part of the new one if it had to be emptied */
TEVPF_API TEVPF_STATUS TEV8R1_PF_save(const char* path) TEVPF_NOEXCEPT;

/* Closes the current file and releases it, after saving it in place if `save` is not 0. The file
 * opened before it becomes current; if there is none, the one opened after it. O(file size), to
 * write and to release.
 *   PF_NOPRIV    `save` is not 0 and the file is read-only: it stays open. Every other outcome
 *                closes the file
 *   PF_OPENFAIL  it could not be written, and its changes in memory are lost. Where that matters,
 *                save first and close after the save succeeded */
TEVPF_API TEVPF_STATUS TEV8R1_PF_close(int32_t save) TEVPF_NOEXCEPT;

/* Sets how many slots arrays of parameters and rows get at first (default 25) and whenever they are
 * full (default 10). 0 restores the default.
 *   PF_BADARG  an argument is negative: that setting stays, and the other one is applied */
TEVPF_API TEVPF_STATUS TEV8R1_PF_set_memory_allocation(int32_t initial,
                                                       int32_t increment) TEVPF_NOEXCEPT;

/* ---- Elements of the current file -----------------------------------------------------------
 * PF_NOFILE: no file is current. PF_NOELEM: the file has no list (table) of that exact name.
 * Lists and tables have separate name spaces. */

/* Creates an empty list or table at the end of the directory.
 *   PF_BADNAME    the name starts with a blank
 *   PF_BADTYPE    elem_type is neither PF_ELEM_LIST nor PF_ELEM_TABLE
 *   PF_DUPLICATE  an element of that kind has the same first 19 bytes
 *   PF_NOMEM      memory ran out; a list that got no memory for parameters stays, empty */
TEVPF_API TEVPF_STATUS TEV8R1_PF_create_elem(const char* name, const char* description,
                                             int32_t elem_type) TEVPF_NOEXCEPT;

/* PF_NORMAL if no list (table) has the same first 19 bytes, otherwise PF_DUPLICATE. */
TEVPF_API TEVPF_STATUS TEV8R1_check_list_unique(const char* name) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_check_table_unique(const char* name) TEVPF_NOEXCEPT;

/* Renames an element. If both names have the same first 19 bytes, returns PF_NORMAL without any
 * check.
 *   PF_BADNAME, PF_BADTYPE, PF_DUPLICATE
 *             as for creating; PF_DUPLICATE is checked before PF_NOELEM */
TEVPF_API TEVPF_STATUS TEV8R1_modify_elem_name(int32_t elem_type, const char* old_name,
                                               const char* new_name) TEVPF_NOEXCEPT;

/* Replaces an element's description.
 *   PF_BADTYPE  elem_type is neither PF_ELEM_LIST nor PF_ELEM_TABLE */
TEVPF_API TEVPF_STATUS TEV8R1_modify_elem_desc(int32_t elem_type, const char* name,
                                               const char* description) TEVPF_NOEXCEPT;

/* Deletes an element and everything in it. O(number of elements + size of the element). */
TEVPF_API TEVPF_STATUS TEV8R1_PF_delete_list(const char* name) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_PF_delete_table(const char* name) TEVPF_NOEXCEPT;

/* Copies an element to the end of the directory. The copy shares no storage with its source. O(size
 * of the element).
 *   PF_BADNAME    the new name starts with a blank
 *   PF_DUPLICATE  an element of that kind has the same first 19 bytes */
TEVPF_API TEVPF_STATUS TEV8R1_PF_copy_list(const char* source_name,
                                           const char* new_name) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_PF_copy_table(const char* source_name,
                                            const char* new_name) TEVPF_NOEXCEPT;

/* ---- Values ---------------------------------------------------------------------------------
 * PF_BADTYPE: the type is none of PF_TYPE_INT .. PF_TYPE_SHORT. */

/* Bytes of one value: int 4, real 4, string width + 1, double 8, short 2. */
TEVPF_API TEVPF_STATUS TEV8R1_compute_size(int32_t type, int32_t width,
                                           int32_t* size_out) TEVPF_NOEXCEPT;

/* Converts text to a binary value of the type. O(length of the text), like every operation that
 * takes a text.
 *   destination  storage of the value's size; for strings, of the whole text and its terminator
 *   PF_BADARG  not a number of that type, or something follows it (blanks included)
 *   PF_RANGE   the number is outside the type's range */
TEVPF_API TEVPF_STATUS TEV8R1_from_char(int32_t type, const char* text,
                                        void* destination) TEVPF_NOEXCEPT;

/* The numeric conversions by themselves, with the statuses above. The length of an integer's text
 * counts too: more than 10 digits, leading zeros included, are out of range. The empty text gives
 * 0; for doubles it leaves the result unchanged. */
TEVPF_API TEVPF_STATUS TEV8R1_convert_int(const char* text, int32_t* result) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_convert_short(const char* text, int16_t* result) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_convert_double(const char* text, double* result) TEVPF_NOEXCEPT;

/* Formats a value as text.
 *   format       a printf format for one argument (int, double or text, by type), or null for %d,
 *                %g or %s
 *   destination  the caller's buffer, large enough for the text and its terminator
 *   length_out   bytes written, without the terminator */
TEVPF_API TEVPF_STATUS TEV8R1_to_char(int32_t type, const char* format, const void* value,
                                      char* destination, int32_t* length_out) TEVPF_NOEXCEPT;

/* Compares two values of a type: (TEVPF_STATUS)-1 if a is smaller, 1 if a is greater, PF_NORMAL if
 * they are equal. Reals and doubles are equal if they differ by at most `tolerance`. A string b
 * whose first "*" is its last byte equals every text that starts with the bytes before the "*". */
TEVPF_API TEVPF_STATUS TEV8R1_compare(int32_t type, const void* a, const void* b,
                                      double tolerance) TEVPF_NOEXCEPT;

/* The comparison of strings by itself. Bytes are compared as unsigned numbers. */
TEVPF_API TEVPF_STATUS TEV8R1_string_compare(const char* text, const char* pattern) TEVPF_NOEXCEPT;

/* ---- Lists: parameters ----------------------------------------------------------------------
 * Every operation that names a list, here and in the next two groups: PF_NOFILE, PF_NOELEM (no such
 * list). Every operation that names a parameter: PF_NOPARAM (no such parameter). A parameter name
 * whose first "*" is its last byte is a pattern: it finds the first parameter, in name order, that
 * starts with the bytes before the "*". Positions count from 0.
 *
 * Adding, deleting, renaming and moving a parameter costs O(log n) comparisons and moves of a few
 * hundred entries, at any size. What goes over the whole list afterwards (saving, dumps, copies) first
 * takes O(n) to put it in order again, and may return PF_NOMEM. */

/* Adds a parameter before the one at `position`. PF_END_POS or a position after the last one adds
 * it at the end, a negative position at the front. str.length is ignored, and a null str.value is
 * the empty text.
 *   PF_DUPLICATE  the list has a parameter of that name
 *   PF_BADNAME    the name starts with a blank
 *   PF_BADTYPE    no such value type
 *   PF_BADRANGE   max is less than min
 *   PF_RANGE      value is outside min..max
 *   PF_BADPREC    precision is less than 1 (reals and doubles)
 * A refusal may leave more spare slots than before, and nothing else. */
TEVPF_API TEVPF_STATUS TEV8R1_PF_add_param(const char* list_name, const TEVPF_PARAM_DEF* definition,
                                           int32_t position) TEVPF_NOEXCEPT;

/* Deletes a parameter. The cursor is a position and is not adjusted. */
TEVPF_API TEVPF_STATUS TEV8R1_PF_delete_param(const char* list_name,
                                              const char* param_name) TEVPF_NOEXCEPT;

/* Replaces everything except the name of the parameter that definition.name selects. The str fields
 * are read as for adding. O(length of the texts).
 *   PF_BADNAME, PF_BADTYPE, PF_BADRANGE, PF_RANGE, PF_BADPREC  as for adding */
TEVPF_API TEVPF_STATUS TEV8R1_PF_modify_param_def(const char* list_name,
                                                  TEVPF_PARAM_DEF definition) TEVPF_NOEXCEPT;

/* Renames a parameter. The new name is cut to 19 bytes and not checked for a blank.
 *   PF_DUPLICATE  another parameter has the new name */
TEVPF_API TEVPF_STATUS TEV8R1_PF_modify_param_name(const char* list_name, const char* old_name,
                                                   const char* new_name) TEVPF_NOEXCEPT;

/* Moves a parameter to new_position (PF_END_POS: last). The cursor is not adjusted.
 *   PF_BADPOS  new_position is outside 0..n-1 */
TEVPF_API TEVPF_STATUS TEV8R1_PF_move_param(const char* list_name, const char* param_name,
                                            int32_t new_position) TEVPF_NOEXCEPT;

/* Adds to *btf the stored size of new_type's part less that of old_type's. Always PF_NORMAL. */
TEVPF_API TEVPF_STATUS TEV8R1_adjust_param_size_btf(int32_t old_type, int32_t new_type,
                                                    int32_t* btf) TEVPF_NOEXCEPT;

/* The bytes that a parameter takes in the file.
 *   description  or null
 *   length       length of a string's value, without terminator; ignored for numbers
 *   PF_BADTYPE  no such value type */
TEVPF_API TEVPF_STATUS TEV8R1_calc_param_bytes(int32_t type, const char* description,
                                               int32_t length, int32_t* bytes_out) TEVPF_NOEXCEPT;

/* ---- Lists: values and defaults ------------------------------------------------------------- */

/* Changes a value within its bounds. The bounds are inclusive and exact, without a tolerance. The
 * cursor does not move.
 *   value  int32_t, float, text, double or int16_t, by the parameter's type
 *   PF_BADRANGE  the parameter's own max is less than its min
 *   PF_RANGE     the value is outside the bounds */
TEVPF_API TEVPF_STATUS TEV8R1_PF_modify_param(const char* list_name, const char* param_name,
                                              const void* value) TEVPF_NOEXCEPT;

/* Copies a value and makes its parameter current.
 *   value_out  as many bytes as the value size that TEV8R1_PF_inq_param_size reports */
TEVPF_API TEVPF_STATUS TEV8R1_PF_get_param_value(const char* list_name, const char* param_name,
                                                 void* value_out) TEVPF_NOEXCEPT;

/* Copies the value out of a definition, strings with their terminator.
 *   PF_BADTYPE  no such value type */
TEVPF_API TEVPF_STATUS TEV8R1_load_param_value(const TEVPF_PARAM_DEF* definition,
                                               void* value_out) TEVPF_NOEXCEPT;

/* Sets a definition's value from text. The argument `type` decides; definition->type is not read. A
 * string value becomes a new block that the caller owns (free); str.length is not written.
 *   PF_BADARG, PF_RANGE, PF_BADTYPE  as for TEV8R1_from_char */
TEVPF_API TEVPF_STATUS TEV8R1_store_param_value(int32_t type, const char* text,
                                                TEVPF_PARAM_DEF* definition) TEVPF_NOEXCEPT;

/* The list's default definition of a type. Its description and string value, if present, are new
 * blocks that the caller owns (free).
 *   PF_BADTYPE  no such value type */
TEVPF_API TEVPF_STATUS TEV8R1_PF_inq_param_dft(const char* list_name, int32_t type,
                                               TEVPF_PARAM_DEF* definition_out) TEVPF_NOEXCEPT;

/* Replaces the list's default definition of definition.type. Defaults are not stored in the file. A
 * null str.value is the empty text; str.length is kept as given.
 *   PF_BADNAME, PF_BADTYPE, PF_BADRANGE, PF_RANGE, PF_BADPREC  as for adding a parameter */
TEVPF_API TEVPF_STATUS TEV8R1_PF_set_param_dft(const char* list_name,
                                               TEVPF_PARAM_DEF definition) TEVPF_NOEXCEPT;

/* A new array of the five initial default definitions, in type order. The caller owns the array and
 * the text in the string definition (free both). */
TEVPF_API TEVPF_STATUS TEV8R1_load_param_dft(TEVPF_PARAM_DEF** table_out) TEVPF_NOEXCEPT;

/* ---- Lists: traversal and inquiry -----------------------------------------------------------
 * Each list has a cursor: the position of its current parameter, or -1 before the first.
 * Definitions are written into the caller's record. Before the call, description must point to a
 * buffer of the description size and, for a string parameter, part.str.value to one of the value
 * size. The size inquiries report both sizes; they are at least 1, for the empty text. The two
 * pointers stay, and everything else is overwritten. */

/* Name and value of the next parameter. The cursor advances, even past the last parameter, so that
 * a step back then delivers the last one.
 *   name_out   at least TEVPF_NAME_SIZE bytes; only the name's text and its terminator are written
 *   value_out  as many bytes as the value size that TEV8R1_PF_inq_next_param_size reports
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
 *   PF_BADPOS  position is outside 0..n-1 */
TEVPF_API TEVPF_STATUS TEV8R1_PF_get_param_def(const char* list_name, const char* param_name,
                                               TEVPF_PARAM_DEF* definition) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_PF_get_param_def_by_pos(const char* list_name, int32_t position,
                                                      TEVPF_PARAM_DEF* definition) TEVPF_NOEXCEPT;

/* Type and buffer sizes (terminators included) of the named parameter, of the one at a position, or
 * of the next one. The cursor does not move.
 *   PF_BADPOS  position is outside 0..n-1
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
 *   PF_BADPOS  position is outside 0..n-1 */
TEVPF_API TEVPF_STATUS TEV8R1_set_cur_param(const char* list_name, int32_t position) TEVPF_NOEXCEPT;

/* A parameter's position; whether it exists (PF_NORMAL or PF_NOPARAM); its type. */
TEVPF_API TEVPF_STATUS TEV8R1_inq_param_pos(const char* list_name, const char* param_name,
                                            int32_t* position_out) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_inq_param_exists(const char* list_name,
                                               const char* param_name) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_get_param_type(const char* list_name, const char* param_name,
                                             int32_t* type_out) TEVPF_NOEXCEPT;

/* Switches interactive mode on for all tables, if the list exists. Rows are then stored without
 * value checks. */
TEVPF_API TEVPF_STATUS TEV8R1_set_interactive_list(const char* list_name) TEVPF_NOEXCEPT;

/* ---- Tables: columns ------------------------------------------------------------------------
 * Every operation: PF_NOFILE, PF_NOELEM (no such table). Every operation that names a column:
 * PF_NOCOLUMN (no such column). Column names are matched exactly. */

/* Appends a column. Existing rows get its min, or the empty text; the added bytes are otherwise
 * zero. O(rows).
 *   PF_BADNAME    the name starts with a blank
 *   PF_DUPLICATE  the table has a column of that name
 *   PF_BADUNIQUE  the column is indexed and unique, and the table has rows
 *   PF_BADTYPE    no such value type
 *   PF_BADRANGE   max is less than min
 *   PF_BADPREC    precision is less than 1 (reals and doubles)
 *   PF_BADWIDTH   width is less than 1, or the row would be longer than 2^31 - 1 bytes */
TEVPF_API TEVPF_STATUS TEV8R1_PF_def_column(const char* table_name,
                                            TEVPF_COL_DEF definition) TEVPF_NOEXCEPT;

/* Replaces a column's definition, including its name. The default row is reset to the minimums.
 * O(rows) for the checks, O(rows log rows) if the column gets an index.
 *   PF_BADNAME, PF_DUPLICATE, PF_BADTYPE, PF_BADRANGE, PF_BADPREC, PF_BADWIDTH  as above
 *   PF_TYPECHG    the type changes, and the table has rows
 *   PF_RANGE      a row holds a value outside the new bounds
 *   PF_BADCOLCHG  the width of a string column changes, and the table has rows
 *   PF_NOTUNIQUE  the column becomes unique, and two rows hold the same value */
TEVPF_API TEVPF_STATUS TEV8R1_PF_modify_col_def(const char* table_name, const char* column_name,
                                                TEVPF_COL_DEF definition) TEVPF_NOEXCEPT;

/* Deletes a column; deleting the last one deletes all rows. O(rows). */
TEVPF_API TEVPF_STATUS TEV8R1_PF_delete_col(const char* table_name,
                                            const char* column_name) TEVPF_NOEXCEPT;

/* Moves a column before another one, or to the end if before_name is null. O(rows). */
TEVPF_API TEVPF_STATUS TEV8R1_PF_move_col(const char* table_name, const char* column_name,
                                          const char* before_name) TEVPF_NOEXCEPT;

/* A column's definition, by name or by position in column order. Its description, if present, is a
 * new block that the caller owns (free). On PF_NOMEM the rest of def_out is written, and its
 * description is null.
 *   PF_BADPOS  pos is outside 0..columns-1 */
TEVPF_API TEVPF_STATUS TEV8R1_PF_inq_col_def(const char* table_name, const char* column_name,
                                             TEVPF_COL_DEF* def_out) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_PF_inq_col_def_by_pos(const char* table_name, int32_t pos,
                                                    TEVPF_COL_DEF* def_out) TEVPF_NOEXCEPT;

/* Names, or offsets within a row, of all columns in column order: new arrays that the caller owns
 * (free). Without columns the count is 0 and the array pointer is not written. O(columns). */
TEVPF_API TEVPF_STATUS TEV8R1_PF_inq_col_names(const char* table_name, int32_t* count_out,
                                               char (**names_out)[TEVPF_NAME_SIZE]) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_PF_inq_col_offsets(const char* table_name, int32_t* count_out,
                                                 int32_t** offsets_out) TEVPF_NOEXCEPT;

/* Sets and reads the table's template of a value type: an initial definition for callers that
 * define columns. The library does not use templates, and they are not stored in the file. A
 * description in def_out is a new block that the caller owns (free).
 *   PF_BADTYPE  no such value type */
TEVPF_API TEVPF_STATUS TEV8R1_PF_set_col_dft(const char* table_name,
                                             TEVPF_COL_DEF def) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_PF_inq_col_dft(const char* table_name, int32_t type,
                                             TEVPF_COL_DEF* def_out) TEVPF_NOEXCEPT;

/* The value type of a column. */
TEVPF_API TEVPF_STATUS TEV8R1_get_col_type(const char* table_name, const char* column_name,
                                           int32_t* type_out) TEVPF_NOEXCEPT;

/* Checks a definition's bounds and precision: PF_NORMAL, PF_BADRANGE, PF_BADPREC or PF_BADTYPE. */
TEVPF_API TEVPF_STATUS TEV8R1_validate_col_range(const TEVPF_COL_DEF* definition) TEVPF_NOEXCEPT;

/* The bytes that a column takes in the file.
 *   description  or null
 *   PF_BADTYPE  no such value type */
TEVPF_API TEVPF_STATUS TEV8R1_calc_col_bytes(int32_t type, const char* description,
                                             int32_t* bytes_out) TEVPF_NOEXCEPT;

/* A column's display width: the larger of its width and the length of its name. Not a status. */
TEVPF_API int32_t TEV8R1_calc_col_width(int32_t width, int32_t name_length) TEVPF_NOEXCEPT;

/* ---- Tables: rows ---------------------------------------------------------------------------
 * Every operation: PF_NOFILE, PF_NOELEM (no such table).
 *
 * A row is row_wid bytes, with each column's value at its offset. Rows are kept byte for byte as
 * the caller or the file supplies them, including padding bytes and the bytes after a text's
 * terminator. Only a string field without any terminator gets one, in its last byte. Bytes that the
 * library adds itself (default rows, widened rows) are zero.
 *
 * A row number counts rows in storage order. A position counts rows in traversal order, which is
 * storage order unless a search column is set, and then the order of that column. The cursor
 * (current row, next row) holds positions.
 *
 * The value checks are PF_RANGE (a value is outside its column's bounds by more than the column's
 * tolerance) and PF_DUPLICATE (another row of a unique column holds an equal value). Interactive
 * mode switches them off where the comment says so.
 *
 * Changes cost O(log n) comparisons for each index, and moves of a few hundred entries, at any size.
 * What goes over the whole table afterwards (saving, dumps, changes of columns) first takes O(n) to put
 * it in order again. Any operation may return PF_NOMEM; the table is then as it was. */

/* Append a row; insert it before a row number (PF_END_POS or a number after the last one: at the
 * end; negative: at the front); or append it after copying the default row's value, in the caller's
 * buffer, into each column whose entry in `supplied` is 0. The cursor stays. The value checks apply
 * unless interactive mode is on. A refusal may leave spare slots. */
TEVPF_API TEVPF_STATUS TEV8R1_PF_add_row(const char* table_name, const void* row) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_PF_add_row_by_pos(const char* table_name, const void* row,
                                                int32_t row_number) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_PF_add_row_with_dft(const char* table_name, void* row,
                                                  const int32_t* supplied) TEVPF_NOEXCEPT;

/* Replaces the current row. The value checks always apply; the unique values of the replaced row do
 * not count as duplicates.
 *   PF_NOCURROW  no row is current */
TEVPF_API TEVPF_STATUS TEV8R1_PF_replace_row(const char* table_name,
                                             const void* row) TEVPF_NOEXCEPT;

/* Deletes the current row. Afterwards no row is current, and the next row delivered is the one that
 * followed.
 *   PF_NOCURROW  no row is current */
TEVPF_API TEVPF_STATUS TEV8R1_PF_delete_row(const char* table_name) TEVPF_NOEXCEPT;

/* Moves row number `from` so that it becomes row number `to`, or the last row. The cursor stays.
 *   PF_SEARCHSET  a search column is set
 *   PF_BADPOS     no such row, or fewer than two rows
 *   PF_RANGE, PF_DUPLICATE  the row does not pass the value checks and stays where it was */
TEVPF_API TEVPF_STATUS TEV8R1_PF_move_row(const char* table_name, int32_t from,
                                          int32_t to) TEVPF_NOEXCEPT;

/* Copies the row at the next position, or at a position, to row_out (row_wid bytes) and makes it
 * current. O(1).
 *   PF_NOMORE  there is no next row
 *   PF_BADPOS  pos is outside 0..rows-1 */
TEVPF_API TEVPF_STATUS TEV8R1_PF_get_next_row(const char* table_name, void* row_out) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_PF_get_row_by_pos(const char* table_name, int32_t pos,
                                                void* row_out) TEVPF_NOEXCEPT;

/* Puts the cursor before the first row. */
TEVPF_API TEVPF_STATUS TEV8R1_PF_reset_table(const char* table_name) TEVPF_NOEXCEPT;

/* Sets and reads the default row (row_wid bytes). It is not stored in the file. Setting it checks
 * the bounds unless interactive mode is on; values that a unique column already holds are
 * allowed. */
TEVPF_API TEVPF_STATUS TEV8R1_PF_set_dft_row(const char* table_name,
                                             const void* row) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_PF_inq_dft_row(const char* table_name, void* row_out) TEVPF_NOEXCEPT;

/* Copies one column's values of all rows, contiguously and in storage order. O(n).
 *   values_out  rows * value size bytes
 *   PF_NOMORE    the table has no rows
 *   PF_NOCOLUMN  no such column */
TEVPF_API TEVPF_STATUS TEV8R1_PF_get_col_values(const char* table_name, const char* column_name,
                                                void* values_out) TEVPF_NOEXCEPT;

/* The number of rows; and all counts of a table: columns, rows, bytes per row, characters of a row
 * as reports show it (0 until a report has computed it), position of the current row (-1: none). */
TEVPF_API TEVPF_STATUS TEV8R1_PF_inq_num_rows(const char* table_name,
                                              int32_t* num_rows_out) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_PF_inq_table_info(const char* table_name, int32_t* num_cols_out,
                                                int32_t* num_rows_out, int32_t* row_wid_out,
                                                int32_t* dsp_wid_out,
                                                int32_t* cur_row_out) TEVPF_NOEXCEPT;

/* Applies the value checks to one value of one column, even in interactive mode. O(log n) for a
 * unique column.
 *   PF_NOCOLUMN  no such column
 *   PF_RANGE, PF_DUPLICATE  the value checks */
TEVPF_API TEVPF_STATUS TEV8R1_validate_row_value(const char* table_name, const char* column_name,
                                                 const void* value) TEVPF_NOEXCEPT;

/* Switches interactive mode on for all tables, if the table exists; and off. */
TEVPF_API TEVPF_STATUS TEV8R1_set_interactive_table(const char* table_name) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_turn_off_interactive(void) TEVPF_NOEXCEPT;

/* ---- Tables: search -------------------------------------------------------------------------
 * Every operation: PF_NOFILE, PF_NOELEM (no such table).
 * A file can hold an index that lists every row once but is not in order, and texts that end in "*"
 * in an indexed column. Searches in such a column end, stay inside the table and change nothing,
 * but which rows they find is not promised. */

/* Sets the search column, or removes it if column_name is null. The cursor stays.
 *   PF_NOCOLUMN   no such column
 *   PF_BADSEARCH  it has no index; the search column stays as it was */
TEVPF_API TEVPF_STATUS TEV8R1_PF_define_table_search(const char* table_name,
                                                     const char* column_name) TEVPF_NOEXCEPT;

/* Searches, from the next position on, for a row whose column has the value `key`. Copies the row
 * to row_out (row_wid bytes) and makes it current. O(log n) in the search column, otherwise O(n).
 *
 * A column of numbers that is searched often, without a change of rows in between, gets a
 * contiguous copy of its values, which makes further searches faster. The search column gets it
 * after 4,096 searches (n / 256 searches if the table has more than a million rows), a column
 * without an index after searches have looked at a million rows (n rows, if there are more). Making
 * the copy takes O(n) once. It uses the size of a value for each row, and the next change releases
 * it.
 *   mode  1: in the search column, take the next greater value if there is no equal one
 *   key   binary value of the column's type. A text that ends in "*" finds the texts that start
 *         with the bytes before the "*"
 *   PF_NOTFOUND  no such row; the cursor stays
 *   PF_NOCOLUMN  no such column */
TEVPF_API TEVPF_STATUS TEV8R1_PF_get_row_by_value(const char* table_name, int8_t mode,
                                                  const char* column_name, const void* key,
                                                  void* row_out) TEVPF_NOEXCEPT;

/* Copies the named column's value from the first row whose first column has the value `key`. The
 * cursor is the same afterwards. If the table has no columns, returns PF_NORMAL and writes nothing.
 * O(log n) if the first column is the search column, otherwise O(n). Frequent searches make a copy
 * of the first column's values, as for the operation above.
 *   value_out  as many bytes as the column's value size
 *   PF_NOTFOUND  no such row
 *   PF_NOCOLUMN  no such column */
TEVPF_API TEVPF_STATUS TEV8R1_PF_get_value(const char* table_name, const char* column_name,
                                           const void* key, void* value_out) TEVPF_NOEXCEPT;

/* The row number at a position. Not a status: -1 if the table is not found; a position outside the
 * table is returned unchanged. */
TEVPF_API int32_t TEV8R1_convert_row(const char* table_name, int32_t pos) TEVPF_NOEXCEPT;

/* ---- Reports --------------------------------------------------------------------------------
 * Reports are text files for people to read. The file is created, or emptied if it exists. Write
 * errors are not reported. In a report, "@" stands for a field without a value, and "\0" marks the
 * end of a text that is empty or ends in a blank. A backslash at the end of a line means that the
 * next line continues it. INT, SHT, REAL, DBL and STG are the value types.
 *   PF_OPENFAIL  the path cannot be written
 *   PF_NOFILE, PF_NOELEM  as above; an empty text file is left behind */

/* Dumps the whole current file. PF_NOFILE leaves no text file behind. O(file size). */
TEVPF_API TEVPF_STATUS TEV8R1_PF_dump_file(const char* path) TEVPF_NOEXCEPT;

/* Dump one list; one table with all its columns, and its rows in storage order. O(n). */
TEVPF_API TEVPF_STATUS TEV8R1_PF_dump_list(const char* name, const char* path) TEVPF_NOEXCEPT;
TEVPF_API TEVPF_STATUS TEV8R1_PF_dump_table(const char* name, const char* path) TEVPF_NOEXCEPT;

/* Lists chosen columns and rows of a table, in traversal order. O(rows shown).
 *   definitions   not 0: show the definitions of the columns as well
 *   count, names  the columns, as an array of 20-byte names. A count above the number of columns
 *                 shows all of them, and names is not read
 *   first, last   positions, inclusive; PF_END_POS or a position after the last row: to the end
 *   PF_BADARG    count is less than 1
 *   PF_NOCOLUMN  no such column; nothing is written */
TEVPF_API TEVPF_STATUS TEV8R1_PF_print_table(const char* table_name, const char* path,
                                             int32_t definitions, int32_t count,
                                             const char (*names)[TEVPF_NAME_SIZE], int32_t first,
                                             int32_t last) TEVPF_NOEXCEPT;

/* Replaces backspace, tab, newline, vertical tab, form feed, carriage return and backslash by the
 * escape sequences \b \t \n \v \f \r and \\.
 *   size    in and out: bytes of the block
 *   buffer  in and out: the block, from malloc; it is reallocated if it must grow */
TEVPF_API TEVPF_STATUS TEV8R1_remove_escape_chars(int32_t* size, char** buffer) TEVPF_NOEXCEPT;

/* Replaces such escape sequences, and a backslash with one to three octal digits, by the bytes they
 * stand for, in place. Always PF_NORMAL.
 *   length_out  length of the resulting text, which may contain zero bytes */
TEVPF_API TEVPF_STATUS TEV8R1_insert_escape_chars(char* text, int32_t* length_out) TEVPF_NOEXCEPT;

/* Builds the heading of columns first..last (positions in column order) of a table. O(columns).
 *   gap         number of blanks between neighbouring columns
 *   fill_width  number of blanks that the buffer is filled with first
 *   first_lead  receives the number of blanks before the first name
 *   buffer      room for fill_width, all display widths and gaps, and a terminator */
TEVPF_API TEVPF_STATUS TEV8R1_create_table_header(const char* table_name, int32_t first,
                                                  int32_t last, int32_t gap, int32_t fill_width,
                                                  int32_t* first_lead, char* buffer) TEVPF_NOEXCEPT;

/* ---- Building blocks ------------------------------------------------------------------------
 * Operations that the library uses itself and exports as well. */

/* Copies count bytes; the ranges may overlap. The source comes before the destination. Always
 * PF_NORMAL. */
TEVPF_API TEVPF_STATUS TEV8R1_memcpy(int32_t count, const void* source,
                                     void* destination) TEVPF_NOEXCEPT;

/* A new copy of a text that the caller owns (free), or null if out of memory. Not a status. */
TEVPF_API char* TEV8R1_strdup(const char* text) TEVPF_NOEXCEPT;

/* Grows an array of `count` entries of `size` bytes by `increment` entries. If count is 0,
 * allocates a new zeroed block and ignores the old pointer; otherwise resizes the block and does
 * not zero the added bytes.
 *   array          in and out: the block, from malloc
 *   first_new_out  the first byte after the `count` existing entries
 *   PF_NOMEM  the block stays as it was */
TEVPF_API TEVPF_STATUS TEV8R1_allocate_elem(int32_t count, int32_t increment, int32_t size,
                                            void** array, void** first_new_out) TEVPF_NOEXCEPT;

/* Inserts `value` into an array of `count` entries that has room for one more. A position outside
 * 0..count inserts nothing. Always PF_NORMAL. O(count). */
TEVPF_API TEVPF_STATUS TEV8R1_insert_index_value(int32_t* array, int32_t count, int32_t position,
                                                 int32_t value) TEVPF_NOEXCEPT;

/* Removes a row number from an index of `count` entries and lowers every greater row number by 1.
 * Always PF_NORMAL. O(count). */
TEVPF_API TEVPF_STATUS TEV8R1_remove_index(int32_t* index, int32_t row_number,
                                           int32_t count) TEVPF_NOEXCEPT;

/* Searches an index for a key. O(log count); reals and doubles also take one step for each equal
 * entry.
 *   column_base  the column's value in row number 0; that of row number e is e * row_wid bytes
 *                after it
 *   pos_out      PF_NORMAL: the first equal entry. PF_NOTFOUND: where the key would be inserted
 *   PF_CMPFAIL  no such value type; pos_out is not written */
TEVPF_API TEVPF_STATUS TEV8R1_binary_search(int32_t type, double tolerance, int32_t count,
                                            int32_t row_wid, const int32_t* index,
                                            const void* column_base, const void* key,
                                            int32_t* pos_out) TEVPF_NOEXCEPT;

/* The comparison of two index entries that the last TEV8R1_create_index used: negative, 0 or
 * positive, as qsort expects it. a and b point to int32_t row numbers. */
TEVPF_API int32_t TEV8R1_sort_comp(const void* a, const void* b) TEVPF_NOEXCEPT;

/* A new index with the entries 0, 1, 2 ... num_rows - 1 and room for num_rows + free_rows entries.
 * The caller owns it (free). If that is no room at all, PF_NORMAL and null. O(num_rows). */
TEVPF_API TEVPF_STATUS TEV8R1_adjust_index(int32_t num_rows, int16_t free_rows,
                                           int32_t** idx_out) TEVPF_NOEXCEPT;

/* Grows a default row to row_wid bytes, or allocates it if it is null. Writes the definition's min,
 * or the empty text, at `offset`; all other added bytes are zero.
 *   dft_row  in and out: the row, from malloc
 *   size     bytes of the column's value */
TEVPF_API TEVPF_STATUS TEV8R1_adjust_default(void** dft_row, int32_t row_wid,
                                             const TEVPF_COL_DEF* definition, int32_t size,
                                             int32_t offset) TEVPF_NOEXCEPT;

#ifdef __cplusplus
}
#endif

#endif
