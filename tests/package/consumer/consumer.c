/* A user's first program: keeps one parameter in a file and finds it again. */
#include <stdio.h>
#include <string.h>
#include <tevpf.h>

#define FILE_NAME "consumer.pf"

/* Says which step failed, so that the failing test needs no debugger. */
static int expect(TEVPF_STATUS wanted, TEVPF_STATUS status, const char* step) {
  if (status == wanted) return 1;
  fprintf(stderr, "%s: status 0x%08lX instead of 0x%08lX\n", step, (unsigned long)status,
          (unsigned long)wanted);
  return 0;
}

static int write_file(void) {
  TEVPF_PARAM_DEF mass;
  memset(&mass, 0, sizeof mass);
  mass.type = PF_TYPE_DOUBLE;
  strcpy(mass.name, "Mass");
  strcpy(mass.units, "kg");
  mass.part.f64.precision = 4;
  mass.part.f64.value = 12.5;
  mass.part.f64.max = 100.0;
  return expect(PF_NEWFILE, TEV8R1_PF_open(FILE_NAME), "open a new file") &&
         expect(PF_NORMAL, TEV8R1_PF_create_elem("Craft", "One craft", PF_ELEM_LIST), "create") &&
         expect(PF_NORMAL, TEV8R1_PF_add_param("Craft", &mass, PF_END_POS), "add") &&
         expect(PF_NORMAL, TEV8R1_PF_save(NULL), "save") &&
         expect(PF_NORMAL, TEV8R1_PF_close(0), "close");
}

static int read_file(void) {
  double value = 0.0;
  return expect(PF_NORMAL, TEV8R1_PF_open(FILE_NAME), "open the saved file") &&
         expect(PF_NORMAL, TEV8R1_PF_get_param_value("Craft", "Mass", &value), "get") &&
         expect(PF_NORMAL, TEV8R1_PF_close(0), "close again") && value == 12.5;
}

int main(void) {
  int good;
  remove(FILE_NAME);
  good = expect(PF_NORMAL, TEV8R1_PF_init(), "init") && write_file() && read_file();
  return remove(FILE_NAME) == 0 && good ? 0 : 1;
}
