/* Reads a CSV file (RFC 4180) with a header row into memory, as a rectangle of texts. */
#ifndef EXAMPLES_CSV_H
#define EXAMPLES_CSV_H

#include <stddef.h>

typedef struct Csv {
  char* text;     /* the file's contents; the fields lie in it, each with a terminator of its own */
  char** fields;  /* header first, then record after record */
  size_t columns; /* fields per record */
  size_t records; /* without the header */
  size_t used;    /* entries of `fields`, header included */
  size_t capacity; /* room in `fields` */
} Csv;

/* Reads a file. Returns 1, or 0 after a message on stderr (nothing is left to be released then): it
 * cannot be read, a record has more or fewer fields than the header, or memory ran out. */
int csv_read(const char* path, Csv* csv);

/* The name of a column, and the field of a record (from 0) in a column; valid until csv_free. */
const char* csv_header(const Csv* csv, size_t column);
const char* csv_field(const Csv* csv, size_t record, size_t column);

void csv_free(Csv* csv);

#endif
