// What the core knows of a kind of element. It asks for everything else through this record, which the
// folder of the kind fills in.
#pragma once

#include <cstddef>
#include <cstdint>

#include "core/element.h"
#include "core/io/body.h"
#include "core/io/sink.h"

namespace tevpf {

// Every function takes the header that a record of the kind starts with for the record.
struct ElementKind {
  const char* word;            // in error texts
  const char* lead;            // the same with a blank behind it
  std::size_t record_size;     // bytes
  std::int32_t smallest_body;  // btf of an element that holds nothing
  bool streams_body;           // reads its body part by part; else from one block

  // Brings a record that is zero but for its header to the state of a new element.
  void (*start)(TEVPF_ELEM_HEADER& element) noexcept;

  // Gives a new element its first slots; false when memory runs out.
  bool (*reserve)(TEVPF_ELEM_HEADER& element) noexcept;

  // Gives `copy`, a new element with a name of its own, all else that `source` holds; false when memory
  // runs out, and then `copy` is as it was.
  bool (*copy)(TEVPF_ELEM_HEADER& source, TEVPF_ELEM_HEADER& copy) noexcept;

  // Releases a record and everything that it owns.
  void (*release)(TEVPF_ELEM_HEADER* element) noexcept;

  // Creates an element in the current file from its stored form: a header whose texts end in their
  // fields, the header.btf bytes of its body, and what follows them in `input`. The shape of the body is
  // checked before the element is created. A failure behind that leaves the element in the directory
  // with what was built so far, which is a state like any other: sizes, counts and indexes agree.
  //   PF_BADFORMAT, PF_BADTYPE, PF_DUPLICATE, PF_NOMEM
  TEVPF_STATUS (*read)(const TEVPF_ELEM_HEADER& header, Body body, Input& input) noexcept;

  // Writes an element in its stored form.
  //   PF_BADTYPE, PF_NOMEM
  TEVPF_STATUS (*write)(Sink& sink, TEVPF_ELEM_HEADER& element) noexcept;
};

extern const ElementKind list_kind;   // lists/list_kind.cpp
extern const ElementKind table_kind;  // tables/table_kind.cpp

// The kinds by their type codes, which count from 1, in the order in which a file is written. A third
// kind is a folder like lists/ and a line here.
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
