// What the core knows about a kind of element. Everything else goes through this record, which the
// kind's folder provides.
#pragma once

#include <cstddef>
#include <cstdint>

#include "core/element.h"
#include "core/io/body.h"
#include "core/io/sink.h"

namespace tevpf {

// Functions take a record of the kind by the header at its start.
struct ElementKind {
  const char* word;            // in error texts
  const char* lead;            // the same, followed by a blank
  std::size_t record_size;     // bytes
  std::int32_t smallest_body;  // btf of an element that holds nothing
  bool streams_body;           // reads its body part by part; otherwise from one block

  // Initialises a new element in a record that is zero except for its header.
  void (*start)(TEVPF_ELEM_HEADER& element) noexcept;

  // Allocates the first slots of a new element; false when out of memory.
  bool (*reserve)(TEVPF_ELEM_HEADER& element) noexcept;

  // Copies everything except the name from `source` to the new element `copy`; false when out of
  // memory, and then `copy` is unchanged.
  bool (*copy)(TEVPF_ELEM_HEADER& source, TEVPF_ELEM_HEADER& copy) noexcept;

  // Releases a record and everything it owns.
  void (*release)(TEVPF_ELEM_HEADER* element) noexcept;

  // Creates an element in the current file from its stored form: a header with terminated texts,
  // the header.btf bytes of its body, and what follows them in `input`. The shape of the body is
  // checked before the element is created. A later failure leaves the element in the directory with
  // what was built so far; its sizes, counts and indexes agree.
  //   PF_BADFORMAT, PF_BADTYPE, PF_DUPLICATE, PF_NOMEM
  TEVPF_STATUS (*read)(const TEVPF_ELEM_HEADER& header, Body body, Input& input) noexcept;

  // Writes an element in its stored form.
  //   PF_BADTYPE, PF_NOMEM
  TEVPF_STATUS (*write)(Sink& sink, TEVPF_ELEM_HEADER& element) noexcept;
};

extern const ElementKind list_kind;   // lists/list_kind.cpp
extern const ElementKind table_kind;  // tables/table_kind.cpp

// The kinds by type code, starting at 1, in the order in which a file is written. A third kind
// needs a folder like lists/ and an entry here.
inline constexpr const ElementKind* kElementKinds[] = {&list_kind, &table_kind};
inline constexpr std::int32_t kNumKinds = std::size(kElementKinds);
static_assert(PF_ELEM_LIST == 1 && PF_ELEM_TABLE == 2);

constexpr bool is_element_type(std::int32_t elem_type) noexcept {
  return elem_type >= 1 && elem_type <= kNumKinds;
}
constexpr const ElementKind& kind_of(std::int32_t elem_type) noexcept {
  return *kElementKinds[elem_type - 1];
}

}  // namespace tevpf
