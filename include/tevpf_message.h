/* Statuses of libtevpf as people read them: their names, and a sentence about the last failure.
 *
 * Beside its status, most failures leave two short texts in the library: what failed, and where or
 * which limit was violated. They stay until another failure writes its own. A few refusals leave
 * them alone (PF_TYPECHG, PF_SEARCHSET, PF_NOMORE, and where tevpf.h lists no text); a program that
 * must not take an older failure's texts for those of such a refusal clears them before the call.
 *
 * C99 and C++. Nothing here fails, allocates, or depends on the locale. */
#ifndef TEVPF_MESSAGE_H
#define TEVPF_MESSAGE_H

#include <stddef.h>

#include "tevpf.h"

#ifdef __cplusplus
extern "C" {
#endif

/* The name of a status as the program writes it: "PF_RANGE". Never null; "unknown status" for a
 * number that is no status. The text is constant. */
TEVPF_API const char* tevpf_status_name(TEVPF_STATUS status) TEVPF_NOEXCEPT;

/* Writes what a status says in one English sentence, made of the status and the two texts of the
 * most recent failure, such as "'abc' is not a number of type integer". It has neither capital nor
 * full stop, so that it can follow a file's name and a colon. Control characters of the texts are
 * shown as \n, \t, \r or \xNN. Any number is accepted.
 *   buffer  receives as much of the sentence as fits, and a terminator; null only when size is 0
 *   size    bytes of the buffer
 * Returns the length of the whole sentence, without terminator: it was cut unless this is below
 * size. */
TEVPF_API size_t tevpf_message(TEVPF_STATUS status, char* buffer, size_t size) TEVPF_NOEXCEPT;

/* The same sentence from two texts that were kept from an earlier failure. For PF_BADFORMAT, a caller
 * that knows the table or list that was being loaded may name it in `value`, which the library leaves
 * empty: "the file ends inside the rows of table 'parts', or is damaged there".
 *   item, value  never null; empty where there was none */
TEVPF_API size_t tevpf_message_of(TEVPF_STATUS status, const char* item, const char* value,
                                  char* buffer, size_t size) TEVPF_NOEXCEPT;

/* The two texts of the most recent failure: what failed (at most 256 characters), and where or which
 * limit (at most 259). Never null, and valid until the next call into the library. */
TEVPF_API const char* tevpf_error_item(void) TEVPF_NOEXCEPT;
TEVPF_API const char* tevpf_error_value(void) TEVPF_NOEXCEPT;

/* Empties the two texts. */
TEVPF_API void tevpf_clear_error(void) TEVPF_NOEXCEPT;

#ifdef __cplusplus
}
#endif

#endif
