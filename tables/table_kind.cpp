// The table kind: how the core handles tables.
#include "core/element_kind.h"
#include "tables/directory.h"
#include "tables/settle.h"
#include "tables/table_builder.h"
#include "tables/table_fields.h"
#include "tables/table_writer.h"

namespace tevpf {

const ElementKind table_kind = {
    .word = "table",
    .lead = "table ",
    .record_size = sizeof(TEVPF_TABLE),
    .smallest_body = kTableHead,
    .streams_body = false,  // its columns are read twice
    .start = [](TEVPF_ELEM_HEADER& element) noexcept { as_table(&element)->cur_row = -1; },
    .reserve = [](TEVPF_ELEM_HEADER&) noexcept { return true; },
    .copy =
        [](TEVPF_ELEM_HEADER& source, TEVPF_ELEM_HEADER& copy) noexcept {
          return settle(*as_table(&source)) &&
                 copy_table_body(*as_table(&source), *as_table(&copy));
        },
    .release = [](TEVPF_ELEM_HEADER* element) noexcept { release_table(as_table(element)); },
    .read = build_table,
    .write =
        [](Sink& sink, TEVPF_ELEM_HEADER& element) noexcept {
          return store_table(sink, *as_table(&element));
        },
};

}  // namespace tevpf
