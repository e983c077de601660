// The list kind, as the core sees it.
#include "core/element_kind.h"
#include "core/library.h"
#include "lists/directory.h"
#include "lists/list_builder.h"
#include "lists/list_fields.h"
#include "lists/list_writer.h"
#include "lists/settle.h"

namespace tevpf {

const ElementKind list_kind = {
    .word = "list",
    .lead = "list ",
    .record_size = sizeof(TEVPF_LIST),
    .smallest_body = kListHead,
    .streams_body = true,  // a list can be as long as its file
    .start = [](TEVPF_ELEM_HEADER& element) noexcept { as_list(&element)->cur_param = -1; },
    .reserve =
        [](TEVPF_ELEM_HEADER& element) noexcept {
          return reserve_first_params(*as_list(&element), library.alloc_initial);
        },
    .copy =
        [](TEVPF_ELEM_HEADER& source, TEVPF_ELEM_HEADER& copy) noexcept {
          return settle(*as_list(&source)) && copy_list_body(*as_list(&source), *as_list(&copy));
        },
    .release = [](TEVPF_ELEM_HEADER* element) noexcept { release_list(as_list(element)); },
    .read = build_list,
    .write =
        [](Sink& sink, TEVPF_ELEM_HEADER& element) noexcept {
          return store_list(sink, *as_list(&element));
        },
};

}  // namespace tevpf
