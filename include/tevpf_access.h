/* Access to libtevpf for callers that work with several files and know the types of their values:
 * what the C++ interface stands on beside tevpf.h.
 *
 * C99 and C++. */
#ifndef TEVPF_ACCESS_H
#define TEVPF_ACCESS_H

#include <stddef.h>

#include "tevpf.h"

#ifdef __cplusplus
extern "C" {
#endif

/* A handle of the current file, null without one: compared with the handle taken after the file was
 * opened, it tells whether that file is current. A handle is good for comparing only, and only until
 * its file is closed. */
TEVPF_API const void* tevpf_current_file(void) TEVPF_NOEXCEPT;

/* Copies the value of a parameter of a known type. Unlike with TEV8R1_PF_get_param_value, the type is
 * checked, the storage cannot be overrun, and the cursor stays. Costs as there.
 *   type            PF_TYPE_...
 *   value_out       receives the value when it takes no more than `size` bytes; else it is untouched
 *   value_size_out  receives the bytes that the value takes, a string's terminator included
 *   PF_NOFILE, PF_NOELEM, PF_NOPARAM
 *   PF_BADTYPE  the parameter has another type; nothing is written */
TEVPF_API TEVPF_STATUS tevpf_get_value(const char* list_name, const char* param_name, int32_t type,
                                       void* value_out, size_t size,
                                       size_t* value_size_out) TEVPF_NOEXCEPT;

#ifdef __cplusplus
}
#endif

#endif
