// Walking a list: the cursor, and the definitions and values it delivers.
#include <algorithm>
#include <cstring>
#include <limits>

#include "core/base/fetch.h"
#include "core/base/text_field.h"
#include "lists/find.h"
#include "lists/param_record.h"

namespace tevpf {
namespace {

void copy_text(char* out, const char* text) noexcept {
  std::memcpy(out, text, std::strlen(text) + 1);
}

// Makes a parameter the current one and copies its definition into the caller's record, whose two
// pointers refer to the caller's buffers and are kept.
void deliver(TEVPF_LIST& list, std::int32_t position, TEVPF_PARAM_DEF& out) noexcept {
  const TEVPF_PARAM_DEF& definition = param_at(list, position).def;
  TEVPF_PARAM_DEF copy = definition;
  copy.description = out.description;
  if (definition.type == PF_TYPE_STRING) {
    copy.part.str.value = out.part.str.value;
    copy_text(copy.part.str.value, definition.part.str.value);
  }
  copy_text(copy.description, definition.description == nullptr ? "" : definition.description);
  out = copy;
  list.cur_param = position;
}

// slot_at(position) is the slot there.
template <class SlotAt>
inline TEVPF_STATUS step(TEVPF_LIST& list, char* name_out, void* value_out,
                         SlotAt slot_at) noexcept {
  if (list.cur_param < std::numeric_limits<std::int32_t>::max()) ++list.cur_param;
  if (list.cur_param >= list.num_params) return PF_NOMORE;
  const TEVPF_PARAM_DEF& definition = param_in(list, slot_at(list.cur_param)).def;
  fetch_along(&definition, sizeof definition);
  copy_name(name_out, definition.name);
  copy_value(definition, value_out);
  return PF_NORMAL;
}

[[gnu::noinline]] TEVPF_STATUS find_and_step(const char* list_name, char* name_out,
                                             void* value_out) noexcept {
  TEVPF_LIST* list;
  PF_TRY(find_list_to_read(list_name, list));
  return step(*list, name_out, value_out,
              [&](std::int32_t position) { return list->slots.order.at(position); });
}

}  // namespace
}  // namespace tevpf

using namespace tevpf;

// Callers walk millions of parameters, one call for each: the common path, parameters in position
// order, keeps no values across a call.
TEVPF_STATUS TEV8R1_PF_get_next_param(const char* list_name, char* name_out,
                                      void* value_out) noexcept {
  TEVPF_LIST* const list = last_list(list_name);
  if (list == nullptr || !is_in_place(*list)) return find_and_step(list_name, name_out, value_out);
  return step(*list, name_out, value_out, [](std::int32_t position) { return position; });
}

TEVPF_STATUS TEV8R1_PF_get_next_param_def(const char* list_name,
                                          TEVPF_PARAM_DEF* definition) noexcept {
  TEVPF_LIST* list;
  PF_TRY(find_list_to_read(list_name, list));
  if (list->cur_param >= list->num_params - 1) return PF_NOMORE;
  deliver(*list, list->cur_param + 1, *definition);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_get_prev_param_def(const char* list_name,
                                          TEVPF_PARAM_DEF* definition) noexcept {
  TEVPF_LIST* list;
  PF_TRY(find_list_to_read(list_name, list));
  if (list->cur_param <= 0 || list->num_params == 0) return PF_NOMORE;
  // A cursor past the last parameter steps back to the last one.
  deliver(*list, std::min(list->cur_param, list->num_params) - 1, *definition);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_get_param_def(const char* list_name, const char* param_name,
                                     TEVPF_PARAM_DEF* definition) noexcept {
  TEVPF_LIST* list;
  std::int32_t slot;
  PF_TRY(find_param_of(list_name, param_name, list, slot));
  deliver(*list, position_of(*list, slot), *definition);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_get_param_def_by_pos(const char* list_name, std::int32_t position,
                                            TEVPF_PARAM_DEF* definition) noexcept {
  TEVPF_LIST* list;
  PF_TRY(find_list_with(list_name, position, list));
  deliver(*list, position, *definition);
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_PF_reset_param(const char* list_name) noexcept {
  TEVPF_LIST* list;
  PF_TRY(find_list(list_name, list));
  list->cur_param = -1;
  return PF_NORMAL;
}

TEVPF_STATUS TEV8R1_set_cur_param(const char* list_name, std::int32_t position) noexcept {
  TEVPF_LIST* list;
  PF_TRY(find_list(list_name, list));
  if (position < 0 || position >= list->num_params) return PF_BADPOS;
  list->cur_param = position;
  return PF_NORMAL;
}
