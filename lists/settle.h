// Returns a list to the state in which a file loads it: parameters in position order, the name
// index one array of positions. Operations on whole lists (saving, dumps, copies) settle the list
// first, as does every operation that gives an outside caller a pointer to a record.
#pragma once

#include "core/base/status.h"
#include "lists/list.h"

extern "C" {

// Finds a list of the current file by its exact name, and settles it.
//   PF_NOFILE  no file is current; texts empty
//   PF_NOELEM  no such list; texts: "list", the name
//   PF_NOMEM   out of memory while settling it; texts empty
TEVPF_API TEVPF_STATUS TEV8R1_get_list_ptr(const char* name, TEVPF_LIST** list_out) noexcept;

// Finds the first parameter in name order that matches the name or pattern, and its place in the
// name index. The list is settled.
//   PF_NOPARAM  none; place_out: where the name would have to be inserted; texts: the name
//   PF_NOMEM    out of memory while settling the list; texts empty
TEVPF_API TEVPF_STATUS TEV8R1_get_param_ptr(TEVPF_LIST* list, const char* name,
                                            TEVPF_PARAM** param_out,
                                            std::int32_t* place_out) noexcept;

// Removes the entry at a place of the name index; higher positions decrease by one. The list is
// settled first. The caller updates num_params and the records.
//   PF_NOMEM  out of memory while settling it; texts empty
TEVPF_API TEVPF_STATUS TEV8R1_remove_param_from_index(TEVPF_LIST* list,
                                                      std::int32_t place) noexcept;
}

namespace tevpf {

// O(n) if the list is not settled. Returns false when out of memory; the list's contents do not
// change.
[[nodiscard]] bool settle(TEVPF_LIST& list) noexcept;

// Counts a read of a list whose parameters are not in position order, and settles it once reads
// have cost as much as settling.
void count_read(TEVPF_LIST& list) noexcept;

}  // namespace tevpf
