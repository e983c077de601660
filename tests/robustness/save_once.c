/* save_once make FILE | change FILE: makes a file of some megabytes, or changes every value in it and
 * saves it in place. For the kill sweep, which stops it at every system call of the save. */
#include <stdio.h>
#include <string.h>
#include <tevpf.h>

enum { PARAMS = 12000, ROWS = 60000 };

static int failed(const char* what, TEVPF_STATUS status) {
  fprintf(stderr, "%s: 0x%08x\n", what, (unsigned)status);
  return 1;
}

static TEVPF_STATUS make_list(void) {
  TEVPF_STATUS status = TEV8R1_PF_create_elem("list", "many parameters", PF_ELEM_LIST);
  for (int i = 0; i < PARAMS && status == PF_NORMAL; ++i) {
    TEVPF_PARAM_DEF def;
    memset(&def, 0, sizeof def);
    def.type = PF_TYPE_INT;
    snprintf(def.name, sizeof def.name, "p%05d", i);
    def.part.i32.max = 1;
    status = TEV8R1_PF_add_param("list", &def, PF_END_POS);
  }
  return status;
}

static TEVPF_STATUS make_table(void) {
  TEVPF_STATUS status = TEV8R1_PF_create_elem("table", "many rows", PF_ELEM_TABLE);
  TEVPF_COL_DEF def;
  memset(&def, 0, sizeof def);
  def.type = PF_TYPE_INT;
  def.width = 8;
  strcpy(def.name, "n");
  def.idx_flag = 1;
  def.limits.i32.max = ROWS;
  if (status == PF_NORMAL) status = TEV8R1_PF_def_column("table", def);
  for (int32_t i = 0; i < ROWS && status == PF_NORMAL; ++i) status = TEV8R1_PF_add_row("table", &i);
  return status;
}

static TEVPF_STATUS change_values(void) {
  TEVPF_STATUS status = PF_NORMAL;
  const int32_t one = 1;
  for (int i = 0; i < PARAMS && status == PF_NORMAL; ++i) {
    char name[TEVPF_NAME_SIZE];
    snprintf(name, sizeof name, "p%05d", i);
    status = TEV8R1_PF_modify_param("list", name, &one);
  }
  return status == PF_NORMAL ? TEV8R1_PF_move_row("table", ROWS - 1, 0) : status;
}

int main(int argc, char** argv) {
  if (argc != 3) return 2;
  TEV8R1_PF_init();
  TEVPF_STATUS status = TEV8R1_PF_open(argv[2]);
  if (strcmp(argv[1], "make") == 0) {
    if (status != PF_NEWFILE) return failed("open", status);
    status = make_list();
    if (status == PF_NORMAL) status = make_table();
  } else {
    if (status != PF_NORMAL) return failed("open", status);
    status = change_values();
  }
  if (status != PF_NORMAL) return failed("changes", status);
  status = TEV8R1_PF_save(NULL);
  if (status != PF_NORMAL) return failed("save", status);
  status = TEV8R1_PF_close(0);
  return status == PF_NORMAL ? 0 : failed("close", status);
}
