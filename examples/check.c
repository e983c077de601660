/* The library returns numbers; this is the table that gives them their names back. */
#include "check.h"

#include <stddef.h>
#include <stdio.h>
#include <stdlib.h>

typedef struct StatusName {
  TEVPF_STATUS status;
  const char* name;
} StatusName;

#define NAMED(status) \
  { status, #status }

static const StatusName status_names[] = {
    NAMED(PF_NORMAL),    NAMED(PF_NEWFILE),   NAMED(PF_NOMORE),    NAMED(PF_NOTEXACT),
    NAMED(PF_INITDONE),  NAMED(PF_NOTFOUND),  NAMED(PF_FILEOPEN),  NAMED(PF_BADSEARCH),
    NAMED(PF_BADPOS),    NAMED(PF_DUPLICATE), NAMED(PF_CMPFAIL),   NAMED(PF_NOFILE),
    NAMED(PF_BADTYPE),   NAMED(PF_NOMEM),     NAMED(PF_NOCURROW),  NAMED(PF_NOCOLUMN),
    NAMED(PF_NOELEM),    NAMED(PF_NOPARAM),   NAMED(PF_NOTUNIQUE), NAMED(PF_OPENFAIL),
    NAMED(PF_RANGE),     NAMED(PF_BADFORMAT), NAMED(PF_BADCOLCHG), NAMED(PF_BADARG),
    NAMED(PF_BADWIDTH),  NAMED(PF_BADPREC),   NAMED(PF_NOPRIV),    NAMED(PF_BADNAME),
    NAMED(PF_BADFILE),   NAMED(PF_BADUNIQUE), NAMED(PF_BADRANGE),  NAMED(PF_TYPECHG),
    NAMED(PF_SEARCHSET),
};

const char* status_name(TEVPF_STATUS status) {
  for (size_t i = 0; i < sizeof status_names / sizeof status_names[0]; ++i) {
    if (status_names[i].status == status) return status_names[i].name;
  }
  return "an unknown status";
}

void check_status(TEVPF_STATUS expected, TEVPF_STATUS actual, const char* call, const char* file,
                  int line) {
  if (actual == expected) return;
  fflush(stdout);
  fprintf(stderr, "%s:%d: %s\n  returned %s (0x%08lX) instead of %s\n", file, line, call,
          status_name(actual), (unsigned long)actual, status_name(expected));
  exit(EXIT_FAILURE);
}

void require(int holds, const char* condition, const char* file, int line) {
  if (holds) return;
  fflush(stdout);
  fprintf(stderr, "%s:%d: this does not hold: %s\n", file, line, condition);
  exit(EXIT_FAILURE);
}
