// Writes lists in their stored form.
#pragma once

#include <cstdio>

#include "core/io/sink.h"
#include "lists/list.h"

extern "C" {

//   PF_OPENFAIL  not everything could be written; texts: the name of the list
//   PF_BADTYPE   an unknown value type; texts: "parameter", the type
TEVPF_API TEVPF_STATUS TEV8R1_store_list(std::FILE* stream, TEVPF_LIST* list) noexcept;
}

namespace tevpf {

[[nodiscard]] TEVPF_STATUS store_list(Sink& sink, TEVPF_LIST& list) noexcept;

}  // namespace tevpf
