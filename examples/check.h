/* Statuses in the examples: every call is checked where it is made, and the first unexpected status
 * ends the program with the place, the call and the name of what it returned. */
#ifndef EXAMPLES_CHECK_H
#define EXAMPLES_CHECK_H

#include <tevpf.h>

/* Makes a call that must succeed. */
#define CHECK(call) CHECK_IS(PF_NORMAL, call)

/* Makes a call whose expected outcome is another one, such as PF_NOMORE at the end of a walk. */
#define CHECK_IS(expected, call) check_status((expected), (call), #call, __FILE__, __LINE__)

/* Makes sure that something of our own is as it must be: a file could be read, memory was there. */
#define REQUIRE(condition) require((condition) ? 1 : 0, #condition, __FILE__, __LINE__)

void check_status(TEVPF_STATUS expected, TEVPF_STATUS actual, const char* call, const char* file,
                  int line);
void require(int holds, const char* condition, const char* file, int line);

/* The name of a status, for messages: "PF_RANGE". */
const char* status_name(TEVPF_STATUS status);

#endif
