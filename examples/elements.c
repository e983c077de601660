/* A table, from real data: the chemical elements.
 *
 *   example_elements [elements.csv]
 *
 * Makes the parameter file elements.pf in the current directory, searches its table by number and
 * by name, traverses it in the order of a column, replaces, deletes and moves rows, saves it, and
 * compares what it reads back with what was in memory. */
#include <stdio.h>
#include <stdlib.h>
#include <string.h>
#include <tevpf.h>

#include "check.h"
#include "csv.h"

#ifndef EXAMPLE_DATA_DIR
#define EXAMPLE_DATA_DIR "examples/data"
#endif

#define FILE_NAME "elements.pf"
#define TABLE "elements"

/* The columns, in the order of the CSV file and of the table. */
enum { NUMBER, SYMBOL, NAME, WEIGHT, MELTING, PERIOD, GROUP, COLUMNS };
enum { SYMBOL_WIDTH = 2, NAME_WIDTH = 13 };

/* No element melts at absolute zero, weighs nothing or stands in group 0: the minimum of a column
 * means that no figure is given. */
static const double no_melting_point = -273.15;

typedef struct ColumnPlan {
  const char* name;
  const char* units;
  const char* description;
  int32_t type;
  int32_t width;
  int8_t indexed;
  int8_t unique;
  int32_t precision;
  double min, max;
} ColumnPlan;

static const ColumnPlan plans[COLUMNS] = {
    {"number", "", "Atomic number", PF_TYPE_INT, 3, 1, 1, 0, 1, 118},
    {"symbol", "", NULL, PF_TYPE_STRING, SYMBOL_WIDTH, 1, 1, 0, 0, 0},
    {"name", "", "IUPAC name", PF_TYPE_STRING, NAME_WIDTH, 1, 1, 0, 0, 0},
    {"weight", "", "Abridged standard atomic weight", PF_TYPE_REAL, 7, 0, 0, 5, 0, 300},
    {"melting", "degC", "Melting point", PF_TYPE_DOUBLE, 9, 1, 0, 7, -273.15, 5000},
    {"period", "", NULL, PF_TYPE_SHORT, 2, 0, 0, 0, 1, 7},
    {"group", "", NULL, PF_TYPE_SHORT, 2, 0, 0, 0, 0, 18},
};

/* ---- Making the table ------------------------------------------------------------------------ */

static void fill_limits(TEVPF_COL_DEF* def, const ColumnPlan* plan) {
  switch (plan->type) {
    case PF_TYPE_INT:
      def->limits.i32.min = (int32_t)plan->min;
      def->limits.i32.max = (int32_t)plan->max;
      break;
    case PF_TYPE_SHORT:
      def->limits.i16.min = (int16_t)plan->min;
      def->limits.i16.max = (int16_t)plan->max;
      break;
    case PF_TYPE_REAL:
      def->limits.f32.min = (float)plan->min;
      def->limits.f32.max = (float)plan->max;
      def->limits.f32.precision = plan->precision;
      break;
    case PF_TYPE_DOUBLE:
      def->limits.f64.min = plan->min;
      def->limits.f64.max = plan->max;
      def->limits.f64.precision = plan->precision;
      break;
    default: /* strings have no limits */
      break;
  }
}

static void define_column(const ColumnPlan* plan) {
  TEVPF_COL_DEF def;
  memset(&def, 0, sizeof def);
  def.type = plan->type;
  def.width = plan->width;
  def.idx_flag = plan->indexed;
  def.unq_flag = plan->unique;
  def.description = (char*)plan->description; /* the library copies the text */
  snprintf(def.name, sizeof def.name, "%s", plan->name);
  snprintf(def.units, sizeof def.units, "%s", plan->units);
  fill_limits(&def, plan);
  CHECK(TEV8R1_PF_def_column(TABLE, def));
}

/* ---- Rows ------------------------------------------------------------------------------------
 * A row is a block of bytes. The library says how long it is and where each column's value lies. */

typedef struct Layout {
  int32_t row_bytes;
  int32_t* offsets; /* COLUMNS of them */
} Layout;

static Layout get_layout(void) {
  Layout layout;
  int32_t columns, rows, display_width, current;
  CHECK(TEV8R1_PF_inq_table_info(TABLE, &columns, &rows, &layout.row_bytes, &display_width,
                                 &current));
  CHECK(TEV8R1_PF_inq_col_offsets(TABLE, &columns, &layout.offsets));
  REQUIRE(columns == COLUMNS);
  return layout;
}

static char* make_row(const Layout* layout) {
  char* row = calloc(1, (size_t)layout->row_bytes);
  REQUIRE(row != NULL);
  return row;
}

/* What a row says about an element. */
typedef struct Element {
  int32_t number;
  char symbol[SYMBOL_WIDTH + 1];
  char name[NAME_WIDTH + 1];
  float weight;
  double melting;
  int16_t period;
  int16_t group;
} Element;

/* Values are copied out of the row: they need not be aligned there. */
static Element read_row(const Layout* layout, const char* row) {
  Element e;
  memcpy(&e.number, row + layout->offsets[NUMBER], sizeof e.number);
  memcpy(e.symbol, row + layout->offsets[SYMBOL], sizeof e.symbol);
  memcpy(e.name, row + layout->offsets[NAME], sizeof e.name);
  memcpy(&e.weight, row + layout->offsets[WEIGHT], sizeof e.weight);
  memcpy(&e.melting, row + layout->offsets[MELTING], sizeof e.melting);
  memcpy(&e.period, row + layout->offsets[PERIOD], sizeof e.period);
  memcpy(&e.group, row + layout->offsets[GROUP], sizeof e.group);
  return e;
}

static void print_row(const Layout* layout, const char* row) {
  const Element e = read_row(layout, row);
  char weight[32] = "-";
  char melting[32] = "-";
  char group[32] = "-";
  if (e.weight > 0) snprintf(weight, sizeof weight, "%.5g", (double)e.weight);
  if (e.melting > no_melting_point) snprintf(melting, sizeof melting, "%.7g", e.melting);
  if (e.group > 0) snprintf(group, sizeof group, "%d", e.group);
  printf("  %3d  %-2s  %-13s  weight %7s  melts at %9s degC  period %d  group %s\n", (int)e.number,
         e.symbol, e.name, weight, melting, e.period, group);
}

/* Converts one record to a row. `supplied` tells for each column whether the record had a value. */
static void fill_row(const Csv* csv, size_t record, const Layout* layout, char* row,
                     int32_t supplied[COLUMNS]) {
  memset(row, 0, (size_t)layout->row_bytes);
  for (size_t column = 0; column < COLUMNS; ++column) {
    const char* text = csv_field(csv, record, column);
    supplied[column] = text[0] != '\0';
    if (!supplied[column]) continue;
    const int is_text = plans[column].type == PF_TYPE_STRING;
    REQUIRE(!is_text || strlen(text) <= (size_t)plans[column].width);
    CHECK(TEV8R1_from_char(plans[column].type, text, row + layout->offsets[column]));
  }
}

/* ---- The steps of the program ---------------------------------------------------------------- */

static void heading(const char* text) {
  static int number = 0;
  printf("\n%d. %s\n", ++number, text);
}

static void read_data(const char* path, Csv* csv) {
  heading("Read the data");
  REQUIRE(csv_read(path, csv));
  REQUIRE(csv->columns == COLUMNS);
  for (size_t column = 0; column < COLUMNS; ++column) {
    REQUIRE(strcmp(csv_header(csv, column), plans[column].name) == 0);
  }
  printf("  %s: %lu elements\n", path, (unsigned long)csv->records);
}

static Layout make_table(const Csv* csv) {
  heading("Make the parameter file " FILE_NAME " with a table in it");
  remove(FILE_NAME); /* one of an earlier run */
  CHECK_IS(PF_NEWFILE, TEV8R1_PF_open(FILE_NAME));
  CHECK(TEV8R1_PF_create_elem(TABLE, "The chemical elements", PF_ELEM_TABLE));
  for (size_t column = 0; column < COLUMNS; ++column) define_column(&plans[column]);

  const Layout layout = get_layout();
  char* row = make_row(&layout);
  for (size_t i = 0; i < csv->records; ++i) {
    int32_t supplied[COLUMNS];
    fill_row(csv, i, &layout, row, supplied);
    /* What the record does not say comes from the default row: the columns' minimums. */
    CHECK(TEV8R1_PF_add_row_with_dft(TABLE, row, supplied));
  }
  printf("  %d columns, %lu rows of %d bytes\n", COLUMNS, (unsigned long)csv->records,
         (int)layout.row_bytes);
  free(row);
  return layout;
}

/* Makes a column the search column and puts the cursor before the first row in its order. */
static void search_by(const char* column) {
  CHECK(TEV8R1_PF_define_table_search(TABLE, column));
  CHECK(TEV8R1_PF_reset_table(TABLE));
}

static void find_number(const Layout* layout, char* row, int32_t number) {
  search_by("number");
  CHECK(TEV8R1_PF_get_row_by_value(TABLE, 0, "number", &number, row));
  print_row(layout, row);
}

static void find_some_numbers(const Layout* layout, char* row) {
  const int32_t tungsten = 74;
  const int32_t nobody = 119;
  char name[NAME_WIDTH + 1];
  heading("Search by number");
  find_number(layout, row, 26);
  find_number(layout, row, 80);
  /* The first column is the key of the table, so a single value takes a single call. */
  CHECK(TEV8R1_PF_get_value(TABLE, "name", &tungsten, name));
  printf("  the name of %d is %s\n", (int)tungsten, name);
  CHECK_IS(PF_NOTFOUND, TEV8R1_PF_get_value(TABLE, "name", &nobody, name));
  printf("  the name of %d: PF_NOTFOUND\n", (int)nobody);
}

/* Each search goes on behind the row that was found last, until there is none. */
static void find_names(const Layout* layout, char* row) {
  const char* const pattern = "Ca*";
  heading("Search by the start of the name: \"Ca*\"");
  search_by("name");
  TEVPF_STATUS status = TEV8R1_PF_get_row_by_value(TABLE, 0, "name", pattern, row);
  while (status == PF_NORMAL) {
    print_row(layout, row);
    status = TEV8R1_PF_get_row_by_value(TABLE, 0, "name", pattern, row);
  }
  check_status(PF_NOTFOUND, status, "TEV8R1_PF_get_row_by_value", __FILE__, __LINE__);
  printf("  PF_NOTFOUND: no more\n");
}

/* A nearest search passes over the rows without a figure, which come first; from there on the rows
 * are delivered in the order of the column. */
static void coldest(const Layout* layout, char* row) {
  const int8_t nearest = 1;
  const double above_absolute_zero = -273.0;
  heading("Traverse in the order of the melting point, the five lowest ones");
  search_by("melting");
  CHECK(TEV8R1_PF_get_row_by_value(TABLE, nearest, "melting", &above_absolute_zero, row));
  for (int i = 0; i < 5; ++i) {
    print_row(layout, row);
    CHECK(TEV8R1_PF_get_next_row(TABLE, row));
  }
}

static void hottest(const Layout* layout, char* row) {
  int32_t rows;
  heading("The three highest ones, by position in that order");
  CHECK(TEV8R1_PF_inq_num_rows(TABLE, &rows));
  for (int32_t position = rows - 1; position >= rows - 3; --position) {
    CHECK(TEV8R1_PF_get_row_by_pos(TABLE, position, row));
    print_row(layout, row);
  }
  CHECK_IS(PF_BADPOS, TEV8R1_PF_get_row_by_pos(TABLE, rows, row));
  printf("  position %d: PF_BADPOS\n", (int)rows);
}

/* Gives zirconium the standard atomic weight of the revision of 2024 (IUPAC Commission on Isotopic
 * Abundances and Atomic Weights), then tries to give it the number of hydrogen. */
static void replace_row(const Layout* layout, char* row) {
  const float revised = 91.222F;
  const int32_t taken = 1;
  heading("Replace a row: the weight of zirconium as revised in 2024");
  find_number(layout, row, 40);
  memcpy(row + layout->offsets[WEIGHT], &revised, sizeof revised);
  CHECK(TEV8R1_PF_replace_row(TABLE, row));
  find_number(layout, row, 40); /* the replaced row, as it is stored now */

  memcpy(row + layout->offsets[NUMBER], &taken, sizeof taken);
  CHECK_IS(PF_DUPLICATE, TEV8R1_PF_replace_row(TABLE, row));
  printf("  with number 1 instead of 40: PF_DUPLICATE, nothing is changed\n");
}

static void delete_row(const Layout* layout, char* row) {
  const int32_t oganesson = 118;
  int32_t rows;
  heading("Delete a row");
  find_number(layout, row, oganesson);
  CHECK(TEV8R1_PF_delete_row(TABLE));
  CHECK(TEV8R1_PF_inq_num_rows(TABLE, &rows));
  CHECK(TEV8R1_PF_reset_table(TABLE));
  CHECK_IS(PF_NOTFOUND, TEV8R1_PF_get_row_by_value(TABLE, 0, "number", &oganesson, row));
  printf("  deleted; %d rows are left, and the search gives PF_NOTFOUND\n", (int)rows);
}

/* Rows move in storage order, so no search column may stand between. */
static void move_row(const Layout* layout, char* row) {
  heading("Move the row of helium behind that of beryllium");
  CHECK_IS(PF_SEARCHSET, TEV8R1_PF_move_row(TABLE, 1, 3));
  printf("  while a search column is set: PF_SEARCHSET\n");
  CHECK(TEV8R1_PF_define_table_search(TABLE, NULL));
  CHECK(TEV8R1_PF_move_row(TABLE, 1, 3));
  for (int32_t number = 0; number < 5; ++number) {
    CHECK(TEV8R1_PF_get_row_by_pos(TABLE, number, row));
    print_row(layout, row);
  }
}

/* All rows in the order of a search column, or in storage order for a null column. */
static char* copy_rows(const Layout* layout, const char* column, int32_t* count) {
  CHECK(TEV8R1_PF_inq_num_rows(TABLE, count));
  char* rows = malloc((size_t)*count * (size_t)layout->row_bytes);
  REQUIRE(rows != NULL);
  search_by(column);
  for (int32_t i = 0; i < *count; ++i) {
    CHECK(TEV8R1_PF_get_next_row(TABLE, rows + (size_t)i * (size_t)layout->row_bytes));
  }
  CHECK_IS(PF_NOMORE, TEV8R1_PF_get_next_row(TABLE, rows));
  return rows;
}

static void compare_rows(const Layout* layout, const char* column, const char* before,
                         int32_t count_before) {
  int32_t count;
  char* rows = copy_rows(layout, column, &count);
  REQUIRE(count == count_before);
  REQUIRE(memcmp(rows, before, (size_t)count * (size_t)layout->row_bytes) == 0);
  free(rows);
  printf("  %d rows in the order of %s: the same\n", (int)count,
         column == NULL ? "storage" : column);
}

static void save_and_compare(const Layout* layout) {
  static const char* const orders[] = {NULL, "number", "symbol", "name", "melting"};
  enum { ORDERS = sizeof orders / sizeof orders[0] };
  char* before[ORDERS];
  int32_t count;
  heading("Save, close, open again, and compare");
  for (int i = 0; i < ORDERS; ++i) before[i] = copy_rows(layout, orders[i], &count);
  CHECK(TEV8R1_PF_save(NULL));
  CHECK(TEV8R1_PF_close(0));
  CHECK(TEV8R1_PF_open(FILE_NAME));
  for (int i = 0; i < ORDERS; ++i) {
    compare_rows(layout, orders[i], before[i], count);
    free(before[i]);
  }
  CHECK(TEV8R1_PF_close(0));
  printf("\nThe file " FILE_NAME " stays in the current directory.\n");
}

int main(int argc, char** argv) {
  Csv csv;
  CHECK(TEV8R1_PF_init());
  read_data(argc > 1 ? argv[1] : EXAMPLE_DATA_DIR "/elements.csv", &csv);
  const Layout layout = make_table(&csv);
  csv_free(&csv);

  char* row = make_row(&layout);
  find_some_numbers(&layout, row);
  find_names(&layout, row);
  coldest(&layout, row);
  hottest(&layout, row);
  replace_row(&layout, row);
  delete_row(&layout, row);
  move_row(&layout, row);
  save_and_compare(&layout);
  free(row);
  free(layout.offsets);
  return EXIT_SUCCESS;
}
