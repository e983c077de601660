/* save_once FILE: makes a file of a megabyte, or changes what is in it, and saves it in place. For the
 * kill sweep, which disturbs it at every system call. */
#include <stdio.h>
#include <string.h>
#include <tevpf.h>

enum { ROWS = 60000 };

static TEVPF_STATUS make_table(void) {
  TEVPF_COL_DEF def = {.type = PF_TYPE_INT, .name = "n", .idx_flag = 1, .width = 8};
  def.limits.i32.max = ROWS;
  TEVPF_STATUS status = TEV8R1_PF_create_elem("table", "many rows", PF_ELEM_TABLE);
  if (status == PF_NORMAL) status = TEV8R1_PF_def_column("table", def);
  for (int32_t i = 0; i < ROWS && status == PF_NORMAL; ++i) {
    status = TEV8R1_PF_add_row("table", &i);
  }
  return status;
}

int main(int argc, char** argv) {
  if (argc != 2) return 2;
  TEV8R1_PF_init();
  TEVPF_STATUS status = TEV8R1_PF_open(argv[1]);
  if (status == PF_NEWFILE) {
    status = make_table();
  } else if (status == PF_NORMAL) {
    status = TEV8R1_PF_move_row("table", ROWS - 1, 0); /* every row moves */
  }
  if (status == PF_NORMAL) status = TEV8R1_PF_save(NULL);
  if (status == PF_NORMAL) status = TEV8R1_PF_close(0);
  if (status != PF_NORMAL) fprintf(stderr, "status 0x%08x\n", (unsigned)status);
  return status != PF_NORMAL;
}
