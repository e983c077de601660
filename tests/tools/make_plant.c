/* make_plant: writes plant.pf, the parameter file of the transcripts. The list holds a parameter of
 * every type; a list and a table share the name "pump"; the text of "odd" is no UTF-8 and would colour a
 * terminal. */
#include <stdio.h>
#include <stdlib.h>
#include <string.h>
#include <tevpf.h>

static void need(TEVPF_STATUS status, TEVPF_STATUS expected) {
  if (status == expected) return;
  fprintf(stderr, "make_plant: status 0x%08lX\n", (unsigned long)status);
  _Exit(1);
}

static TEVPF_PARAM_DEF parameter(int32_t type, const char* name, const char* units,
                                 const char* description) {
  TEVPF_PARAM_DEF def;
  memset(&def, 0, sizeof def);
  def.type = type;
  strcpy(def.name, name);
  strcpy(def.units, units);
  def.description = (char*)description;
  return def;
}

static void add_list(void) {
  TEVPF_PARAM_DEF def;
  need(TEV8R1_PF_create_elem("pump", "Feed pump", PF_ELEM_LIST), PF_NORMAL);
  def = parameter(PF_TYPE_INT, "speed", "rpm", "Nominal speed");
  def.part.i32.value = 1450;
  def.part.i32.max = 3000;
  need(TEV8R1_PF_add_param("pump", &def, PF_END_POS), PF_NORMAL);
  def = parameter(PF_TYPE_REAL, "head", "m", NULL);
  def.part.f32.precision = 3;
  def.part.f32.value = 12.345f;
  def.part.f32.max = 100.1f;
  need(TEV8R1_PF_add_param("pump", &def, PF_END_POS), PF_NORMAL);
  def = parameter(PF_TYPE_DOUBLE, "flow", "l/s", "Mean, \"corrected\"");
  def.part.f64.precision = 4;
  def.part.f64.value = 1.0 / 3.0;
  def.part.f64.max = 1.7976931348623157e308;
  def.part.f64.min = -1.7976931348623157e308;
  need(TEV8R1_PF_add_param("pump", &def, PF_END_POS), PF_NORMAL);
  def = parameter(PF_TYPE_SHORT, "stages", "", NULL);
  def.part.i16.value = 2;
  def.part.i16.max = 9;
  def.part.i16.min = 1;
  need(TEV8R1_PF_add_param("pump", &def, PF_END_POS), PF_NORMAL);
  def = parameter(PF_TYPE_STRING, "odd", "", "Bytes to escape");
  def.part.str.value = (char*)"a\tb\033[31m \xE9 \xC3\xA9";
  need(TEV8R1_PF_add_param("pump", &def, PF_END_POS), PF_NORMAL);
}

static void add_table(const char* name, const char* description) {
  TEVPF_COL_DEF id, level, note;
  need(TEV8R1_PF_create_elem(name, description, PF_ELEM_TABLE), PF_NORMAL);
  need(TEV8R1_PF_inq_col_dft(name, PF_TYPE_SHORT, &id), PF_NORMAL);
  need(TEV8R1_PF_inq_col_dft(name, PF_TYPE_REAL, &level), PF_NORMAL);
  need(TEV8R1_PF_inq_col_dft(name, PF_TYPE_STRING, &note), PF_NORMAL);
  strcpy(id.name, "id");
  id.idx_flag = id.unq_flag = 1;
  strcpy(level.name, "level");
  strcpy(level.units, "mm");
  level.limits.f32.min = -5;
  level.limits.f32.max = 5;
  strcpy(note.name, "note");
  note.width = 8;
  need(TEV8R1_PF_def_column(name, id), PF_NORMAL);
  need(TEV8R1_PF_def_column(name, level), PF_NORMAL);
  need(TEV8R1_PF_def_column(name, note), PF_NORMAL);
}

int main(void) {
  TEV8R1_PF_init();
  need(TEV8R1_PF_open("plant.pf"), PF_NEWFILE);
  add_list();
  add_table("levels", "Tank levels");
  add_table("pump", "");
  need(TEV8R1_PF_close(1), PF_NORMAL);
  return 0;
}
