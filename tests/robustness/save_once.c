/* save_once FILE: changes the table of a file and saves it in place. For the kill sweep, which disturbs
 * it at every system call. */
#include <stdio.h>
#include <tevpf.h>

int main(int argc, char** argv) {
  if (argc != 2) return 2;
  TEV8R1_PF_init();
  TEVPF_STATUS status = TEV8R1_PF_open(argv[1]);
  if (status == PF_NORMAL) status = TEV8R1_PF_move_row("table", 1, 0); /* every row is written */
  if (status == PF_NORMAL) status = TEV8R1_PF_save(NULL);
  if (status == PF_NORMAL) status = TEV8R1_PF_close(0);
  if (status != PF_NORMAL) fprintf(stderr, "status 0x%08x\n", (unsigned)status);
  return status != PF_NORMAL;
}
