#include <stdio.h>
#include <string.h>
#include <tevpf.h>
#include <tevpf_message.h>

static int failed(const char* step, TEVPF_STATUS status) {
  char why[300];
  tevpf_message(status, why, sizeof why);
  fprintf(stderr, "%s failed: %s\n", step, why);
  return 1;
}

int main(void) {
  TEVPF_STATUS status;
  TEVPF_PARAM_DEF thrust;
  double value, too_much = 900.0;

  memset(&thrust, 0, sizeof thrust);
  thrust.type = PF_TYPE_DOUBLE;
  strcpy(thrust.name, "Thrust");
  strcpy(thrust.units, "kN");
  thrust.description = "At sea level";
  thrust.part.f64.precision = 5;
  thrust.part.f64.value = 480.0;
  thrust.part.f64.min = 0.0;
  thrust.part.f64.max = 800.0;

  TEV8R1_PF_init();
  status = TEV8R1_PF_open("engine.pf"); /* creates the file when there is none */
  if (status != PF_NORMAL && status != PF_NEWFILE) return failed("open", status);
  if (status == PF_NEWFILE) {
    status = TEV8R1_PF_create_elem("Engine", "First stage engine", PF_ELEM_LIST);
    if (status != PF_NORMAL) return failed("create", status);
    status = TEV8R1_PF_add_param("Engine", &thrust, PF_END_POS);
    if (status != PF_NORMAL) return failed("add", status);
  }

  status = TEV8R1_PF_get_param_value("Engine", "Thr*", &value); /* the first name like this */
  if (status != PF_NORMAL) return failed("get", status);
  printf("Thrust is %g kN\n", value);

  if (TEV8R1_PF_modify_param("Engine", "Thrust", &too_much) == PF_RANGE)
    printf("%g kN is out of range; the value is as before\n", too_much);

  status = TEV8R1_PF_close(1); /* 1: save first */
  return status == PF_NORMAL ? 0 : failed("close", status);
}
