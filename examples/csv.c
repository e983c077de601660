/* The file is read whole; then every field is unquoted and terminated where it stands. No field
 * grows by that, so none needs memory of its own. */
#include "csv.h"

#include <stdio.h>
#include <stdlib.h>
#include <string.h>

enum { FIRST_READ = 4096 }; /* bytes; doubled as often as needed */

/* The whole file as one terminated text that the caller frees, or null. */
static char* read_text(FILE* stream) {
  size_t capacity = FIRST_READ;
  size_t length = 0;
  char* text = malloc(capacity);
  while (text != NULL) {
    length += fread(text + length, 1, capacity - 1 - length, stream);
    if (length < capacity - 1) break;
    capacity *= 2;
    char* larger = realloc(text, capacity);
    if (larger == NULL) free(text);
    text = larger;
  }
  if (text != NULL && ferror(stream)) {
    free(text);
    text = NULL;
  }
  if (text != NULL) text[length] = '\0';
  return text;
}

/* Unquotes and terminates the field that starts at `in`, and tells the character behind it: a
 * comma, the start of a line end, or 0 at the end of the text. Returns where the next field
 * starts. */
static char* read_field(char* in, char* separator) {
  char* out = in;
  int quoted = 0;
  for (; *in != '\0'; ++in) {
    if (*in == '"' && quoted && in[1] == '"') {
      *out++ = *in++; /* a quote within quotes is doubled */
    } else if (*in == '"') {
      quoted = !quoted;
    } else if (!quoted && strchr(",\r\n", *in) != NULL) {
      break;
    } else {
      *out++ = *in;
    }
  }
  *separator = *in;
  if (*in == '\r' && in[1] == '\n') ++in;
  if (*separator != '\0') ++in;
  *out = '\0';
  return in;
}

static int append_field(Csv* csv, char* field) {
  if (csv->used == csv->capacity) {
    const size_t capacity = csv->capacity == 0 ? 64 : csv->capacity * 2;
    char** larger = realloc(csv->fields, capacity * sizeof *larger);
    if (larger == NULL) return 0;
    csv->fields = larger;
    csv->capacity = capacity;
  }
  csv->fields[csv->used++] = field;
  return 1;
}

/* Appends the fields of the record at *next and moves *next behind it. */
static int read_record(Csv* csv, char** next) {
  const size_t before = csv->used;
  char separator = ',';
  while (separator == ',') {
    char* field = *next;
    *next = read_field(field, &separator);
    if (!append_field(csv, field)) return 0;
  }
  if (csv->columns == 0) csv->columns = csv->used; /* this was the header */
  return csv->used - before == csv->columns;
}

static int read_records(Csv* csv) {
  char* next = csv->text;
  while (*next != '\0') {
    if (!read_record(csv, &next)) return 0;
  }
  if (csv->columns == 0) return 0;
  csv->records = csv->used / csv->columns - 1;
  return 1;
}

int csv_read(const char* path, Csv* csv) {
  memset(csv, 0, sizeof *csv);
  FILE* stream = fopen(path, "rb");
  if (stream != NULL) {
    csv->text = read_text(stream);
    fclose(stream);
  }
  if (csv->text == NULL) {
    fprintf(stderr, "%s: cannot be read\n", path);
    return 0;
  }
  if (!read_records(csv)) {
    const size_t line = csv->columns == 0 ? 1 : csv->used / csv->columns;
    fprintf(stderr, "%s: wrong number of fields near line %lu\n", path, (unsigned long)line);
    csv_free(csv);
    return 0;
  }
  return 1;
}

const char* csv_header(const Csv* csv, size_t column) { return csv->fields[column]; }

const char* csv_field(const Csv* csv, size_t record, size_t column) {
  return csv->fields[(record + 1) * csv->columns + column];
}

void csv_free(Csv* csv) {
  free(csv->fields);
  free(csv->text);
  memset(csv, 0, sizeof *csv);
}
