/* A list of parameters, from real data: the fundamental physical constants.
 *
 *   example_constants [constants.csv]
 *
 * Makes the parameter file constants.pf in the current directory, opens it again, looks constants
 * up, changes one within and one beyond its bounds, and walks the list in both directions. */
#include <stdio.h>
#include <stdlib.h>
#include <string.h>
#include <tevpf.h>

#include "check.h"
#include "csv.h"

#ifndef EXAMPLE_DATA_DIR
#define EXAMPLE_DATA_DIR "examples/data"
#endif

#define FILE_NAME "constants.pf"
#define LIST "constants"

/* Columns of the CSV file. */
enum { NAME, TYPE, VALUE, MINIMUM, MAXIMUM, UNITS, PRECISION, DESCRIPTION, COLUMNS };

static const char* const column_names[COLUMNS] = {"name",    "type",  "value",     "minimum",
                                                  "maximum", "units", "precision", "description"};

/* ---- From text to a definition ---------------------------------------------------------------
 * Each type has its own part of the definition. The numbers are converted into variables of our own
 * first: fields of a definition are packed, so they are assigned, never pointed at. */

typedef const char* const* Record; /* the COLUMNS texts of one constant */

static void fill_integer(TEVPF_PARAM_DEF* def, Record record) {
  int32_t value, min, max;
  CHECK(TEV8R1_convert_int(record[VALUE], &value));
  CHECK(TEV8R1_convert_int(record[MINIMUM], &min));
  CHECK(TEV8R1_convert_int(record[MAXIMUM], &max));
  def->part.i32.value = value;
  def->part.i32.min = min;
  def->part.i32.max = max;
}

static void fill_short(TEVPF_PARAM_DEF* def, Record record) {
  int16_t value, min, max;
  CHECK(TEV8R1_convert_short(record[VALUE], &value));
  CHECK(TEV8R1_convert_short(record[MINIMUM], &min));
  CHECK(TEV8R1_convert_short(record[MAXIMUM], &max));
  def->part.i16.value = value;
  def->part.i16.min = min;
  def->part.i16.max = max;
}

static void fill_real(TEVPF_PARAM_DEF* def, Record record) {
  float value, min, max;
  int32_t precision;
  CHECK(TEV8R1_from_char(PF_TYPE_REAL, record[VALUE], &value));
  CHECK(TEV8R1_from_char(PF_TYPE_REAL, record[MINIMUM], &min));
  CHECK(TEV8R1_from_char(PF_TYPE_REAL, record[MAXIMUM], &max));
  CHECK(TEV8R1_convert_int(record[PRECISION], &precision));
  def->part.f32.value = value;
  def->part.f32.min = min;
  def->part.f32.max = max;
  def->part.f32.precision = precision;
}

static void fill_double(TEVPF_PARAM_DEF* def, Record record) {
  double value, min, max;
  int32_t precision;
  CHECK(TEV8R1_from_char(PF_TYPE_DOUBLE, record[VALUE], &value));
  CHECK(TEV8R1_from_char(PF_TYPE_DOUBLE, record[MINIMUM], &min));
  CHECK(TEV8R1_from_char(PF_TYPE_DOUBLE, record[MAXIMUM], &max));
  CHECK(TEV8R1_convert_int(record[PRECISION], &precision));
  def->part.f64.value = value;
  def->part.f64.min = min;
  def->part.f64.max = max;
  def->part.f64.precision = precision;
}

static void fill_string(TEVPF_PARAM_DEF* def, Record record) {
  def->part.str.value = (char*)record[VALUE]; /* the library copies the text */
}

typedef struct ValueType {
  const char* word; /* in the CSV file */
  int32_t type;
  void (*fill)(TEVPF_PARAM_DEF* def, Record record);
} ValueType;

static const ValueType value_types[] = {
    {"integer", PF_TYPE_INT, fill_integer},  {"real", PF_TYPE_REAL, fill_real},
    {"string", PF_TYPE_STRING, fill_string}, {"double", PF_TYPE_DOUBLE, fill_double},
    {"short", PF_TYPE_SHORT, fill_short},
};
enum { VALUE_TYPES = sizeof value_types / sizeof value_types[0] };

static const ValueType* find_type_by_word(const char* word) {
  for (int i = 0; i < VALUE_TYPES; ++i) {
    if (strcmp(value_types[i].word, word) == 0) return &value_types[i];
  }
  return NULL;
}

static const char* type_word(int32_t type) {
  for (int i = 0; i < VALUE_TYPES; ++i) {
    if (value_types[i].type == type) return value_types[i].word;
  }
  return "?";
}

/* Copies a text into a field of the definition, which must have room for it. */
static void fill_text(char* field, size_t size, const char* text) {
  REQUIRE(strlen(text) < size);
  strcpy(field, text);
}

/* The definition points into the record: it is good for as long as the record is. */
static TEVPF_PARAM_DEF make_definition(Record record) {
  const ValueType* type = find_type_by_word(record[TYPE]);
  REQUIRE(type != NULL);

  TEVPF_PARAM_DEF def;
  memset(&def, 0, sizeof def);
  def.type = type->type;
  fill_text(def.name, sizeof def.name, record[NAME]);
  fill_text(def.units, sizeof def.units, record[UNITS]);
  def.description = (char*)record[DESCRIPTION];
  type->fill(&def, record);
  return def;
}

/* ---- From a definition to the screen --------------------------------------------------------- */

/* A definition that the library can write to: its two pointers lead to buffers. */
typedef struct Parameter {
  TEVPF_PARAM_DEF def;
  char* description;
  char* text; /* the value, for string parameters */
} Parameter;

static int32_t larger(int32_t a, int32_t b) { return a > b ? a : b; }

/* Buffers large enough for any parameter of the list. */
static Parameter make_parameter(void) {
  int32_t count;
  int32_t text_size = 1;
  int32_t desc_size = 1;
  CHECK(TEV8R1_PF_inq_num_params(LIST, &count));
  for (int32_t position = 0; position < count; ++position) {
    int32_t type, value_bytes, desc_bytes;
    CHECK(TEV8R1_PF_inq_param_size_by_pos(LIST, position, &type, &value_bytes, &desc_bytes));
    text_size = larger(text_size, value_bytes);
    desc_size = larger(desc_size, desc_bytes);
  }
  Parameter parameter;
  memset(&parameter, 0, sizeof parameter);
  parameter.text = malloc((size_t)text_size);
  parameter.description = malloc((size_t)desc_size);
  REQUIRE(parameter.text != NULL && parameter.description != NULL);
  return parameter;
}

/* To be called before every definition that is fetched: the value of a number overwrites the
 * pointer to the text buffer, which the next string needs again. */
static TEVPF_PARAM_DEF* ready(Parameter* parameter) {
  parameter->def.description = parameter->description;
  parameter->def.part.str.value = parameter->text;
  return &parameter->def;
}

static void free_parameter(Parameter* parameter) {
  free(parameter->description);
  free(parameter->text);
}

/* Writes a number with its precision, "%.9g", or by its type's own format. */
static void format_number(const TEVPF_PARAM_DEF* def, char* out) {
  const int is_real = def->type == PF_TYPE_REAL;
  double storage; /* any number fits, suitably aligned */
  char format[16] = "%d";
  int32_t length;
  CHECK(TEV8R1_load_param_value(def, &storage));
  if (is_real || def->type == PF_TYPE_DOUBLE) {
    const int32_t precision = is_real ? def->part.f32.precision : def->part.f64.precision;
    snprintf(format, sizeof format, "%%.%dg", (int)precision);
  }
  CHECK(TEV8R1_to_char(def->type, format, &storage, out, &length));
}

static void print_parameter(const TEVPF_PARAM_DEF* def) {
  char number[400]; /* "%g" of a double never needs more */
  const char* value = number;
  if (def->type == PF_TYPE_STRING) {
    value = def->part.str.value;
  } else {
    format_number(def, number);
  }
  printf("  %-19s  %-7s  %s%s%s\n", def->name, type_word(def->type), value,
         def->units[0] == '\0' ? "" : " ", def->units);
}

/* ---- The steps of the program ---------------------------------------------------------------- */

static void heading(const char* text) {
  static int number = 0;
  printf("\n%d. %s\n", ++number, text);
}

static void read_record(const Csv* csv, size_t index, const char* record[COLUMNS]) {
  for (size_t column = 0; column < COLUMNS; ++column) {
    record[column] = csv_field(csv, index, column);
  }
}

static void add_all(const Csv* csv) {
  for (size_t i = 0; i < csv->records; ++i) {
    const char* record[COLUMNS];
    read_record(csv, i, record);
    const TEVPF_PARAM_DEF def = make_definition(record);
    CHECK(TEV8R1_PF_add_param(LIST, &def, PF_END_POS));
  }
}

static void make_file(const Csv* csv) {
  heading("Make the parameter file " FILE_NAME);
  remove(FILE_NAME); /* one of an earlier run */
  CHECK_IS(PF_NEWFILE, TEV8R1_PF_open(FILE_NAME));
  CHECK(TEV8R1_PF_create_elem(LIST, "CODATA 2018 recommended values", PF_ELEM_LIST));
  add_all(csv);
  CHECK(TEV8R1_PF_save(NULL));
  CHECK(TEV8R1_PF_close(0));
  printf("  list \"" LIST "\" made, %lu parameters added; file saved and closed\n",
         (unsigned long)csv->records);
}

/* Compares a number of the open file with the text it was made from. */
static int same_number(Record record) {
  const int32_t type = find_type_by_word(record[TYPE])->type;
  double expected, stored; /* any number fits, suitably aligned */
  CHECK(TEV8R1_from_char(type, record[VALUE], &expected));
  CHECK(TEV8R1_PF_get_param_value(LIST, record[NAME], &stored));
  return TEV8R1_compare(type, &stored, &expected, 0.0) == PF_NORMAL;
}

static int same_text(Record record, Parameter* parameter) {
  CHECK(TEV8R1_PF_get_param_def(LIST, record[NAME], ready(parameter)));
  return strcmp(parameter->text, record[VALUE]) == 0;
}

static void open_again(const Csv* csv) {
  heading("Open it again and compare it with the data");
  CHECK(TEV8R1_PF_open(FILE_NAME));
  Parameter parameter = make_parameter();
  for (size_t i = 0; i < csv->records; ++i) {
    const char* record[COLUMNS];
    read_record(csv, i, record);
    const int is_text = strcmp(record[TYPE], "string") == 0;
    REQUIRE(is_text ? same_text(record, &parameter) : same_number(record));
  }
  free_parameter(&parameter);
  printf("  all %lu values are the same, to the last bit\n", (unsigned long)csv->records);
}

/* Shows the parameter with this name, or the first one, in name order, that fits a pattern. */
static void look_up(const char* name, Parameter* parameter) {
  const TEVPF_STATUS status = TEV8R1_PF_get_param_def(LIST, name, ready(parameter));
  if (status == PF_NOPARAM) {
    printf("  \"%s\" finds nothing: %s\n", name, status_name(status));
    return;
  }
  check_status(PF_NORMAL, status, "TEV8R1_PF_get_param_def", __FILE__, __LINE__);
  printf("  \"%s\" finds: %s\n  ", name, parameter->description);
  print_parameter(&parameter->def);
}

static void look_up_some(void) {
  static const char* const names[] = {"speed_of_light", "source_doi", "electron*", "p*",
                                      "phlogiston"};
  heading("Look constants up by name, or by what the name starts with");
  Parameter parameter = make_parameter();
  for (size_t i = 0; i < sizeof names / sizeof names[0]; ++i) look_up(names[i], &parameter);
  free_parameter(&parameter);
}

/* Tries a new value of G and tells what G is afterwards. */
static void try_gravitation(double value, const char* origin, TEVPF_STATUS expected) {
  double after;
  const TEVPF_STATUS status = TEV8R1_PF_modify_param(LIST, "gravitation", &value);
  check_status(expected, status, "TEV8R1_PF_modify_param", __FILE__, __LINE__);
  CHECK(TEV8R1_PF_get_param_value(LIST, "gravitation", &after));
  printf("  set it to %.6g (%s): %s, so it is %.6g now\n", value, origin, status_name(status),
         after);
}

static void change_values(void) {
  heading("Change the constant of gravitation within and beyond its bounds");
  Parameter parameter = make_parameter();
  CHECK(TEV8R1_PF_get_param_def(LIST, "gravitation", ready(&parameter)));
  const double original = parameter.def.part.f64.value;
  printf("  it is %.6g, bounds %.6g to %.6g\n", original, parameter.def.part.f64.min,
         parameter.def.part.f64.max);
  free_parameter(&parameter);

  try_gravitation(6.67408e-11, "CODATA 2014", PF_NORMAL);
  try_gravitation(6.67259e-11, "CODATA 1986", PF_RANGE);
  try_gravitation(original, "CODATA 2018 again", PF_NORMAL);
}

static void walk_forwards(void) {
  int32_t count;
  int32_t seen = 0;
  heading("Walk the list forwards");
  CHECK(TEV8R1_PF_inq_num_params(LIST, &count));
  Parameter parameter = make_parameter();
  CHECK(TEV8R1_PF_reset_param(LIST)); /* before the first parameter */
  while (TEV8R1_PF_get_next_param_def(LIST, ready(&parameter)) == PF_NORMAL) {
    print_parameter(&parameter.def);
    ++seen;
  }
  CHECK_IS(PF_NOMORE, TEV8R1_PF_get_next_param_def(LIST, ready(&parameter)));
  free_parameter(&parameter);
  REQUIRE(seen == count);
  printf("  PF_NOMORE: all %d were seen\n", (int)seen);
}

/* The cursor stands on the last parameter, where the walk forwards left it. Every parameter is
 * delivered; those whose names fit a pattern are shown. */
static void walk_backwards(int32_t count) {
  const char* const pattern = "electron*";
  int32_t seen = 1;
  heading("Walk back from there, showing the names that start with \"electron\"");
  Parameter parameter = make_parameter();
  while (TEV8R1_PF_get_prev_param_def(LIST, ready(&parameter)) == PF_NORMAL) {
    if (TEV8R1_string_compare(parameter.def.name, pattern) == PF_NORMAL) {
      print_parameter(&parameter.def);
    }
    ++seen;
  }
  CHECK_IS(PF_NOMORE, TEV8R1_PF_get_prev_param_def(LIST, ready(&parameter)));
  free_parameter(&parameter);
  REQUIRE(seen == count);
  printf("  PF_NOMORE: back at the first of %d\n", (int)seen);
}

static void read_data(const char* path, Csv* csv) {
  heading("Read the data");
  REQUIRE(csv_read(path, csv));
  REQUIRE(csv->columns == COLUMNS);
  for (size_t column = 0; column < COLUMNS; ++column) {
    REQUIRE(strcmp(csv_header(csv, column), column_names[column]) == 0);
  }
  printf("  %s: %lu constants\n", path, (unsigned long)csv->records);
}

int main(int argc, char** argv) {
  Csv csv;
  CHECK(TEV8R1_PF_init());
  read_data(argc > 1 ? argv[1] : EXAMPLE_DATA_DIR "/constants.csv", &csv);
  make_file(&csv);
  open_again(&csv);
  look_up_some();
  change_values();
  walk_forwards();
  walk_backwards((int32_t)csv.records);
  CHECK(TEV8R1_PF_close(0)); /* without saving: the file holds what it held */
  printf("\nThe file " FILE_NAME " stays in the current directory.\n");
  csv_free(&csv);
  return EXIT_SUCCESS;
}
