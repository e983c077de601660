// Builds elements from their stored form.
//
// The shape of a body is checked before its element is created; what does not hold together is
// refused. A failure behind that leaves the element in the directory with the parameters or columns
// built so far, which is a state like any other: sizes, counts and indexes agree.
#pragma once

#include "core/element.h"
#include "core/io/body.h"

namespace tevpf {

// What taking one stored parameter or column off a body came to.
enum class Parsed {
  kWhole,
  kCutOff,       // it goes on behind the bytes at hand
  kBroken,       // it contradicts itself, or the body ends inside it
  kUnknownType,  // so that nobody knows its size
  kNoMemory,
};

//   header      its texts end within their fields
//   body        header.btf bytes
//   input       gives what follows the body
//   PF_BADFORMAT, PF_BADTYPE, PF_DUPLICATE, PF_NOMEM
[[nodiscard]] TEVPF_STATUS build_list(const TEVPF_ELEM_HEADER& header, Body body,
                                      Input& input) noexcept;
[[nodiscard]] TEVPF_STATUS build_table(TEVPF_ELEM_HEADER header, const void* body,
                                       Input& input) noexcept;

}  // namespace tevpf
