#include "lists/list_writer.h"

#include <cstring>

#include "core/base/status.h"
#include "core/writer.h"
#include "lists/list_fields.h"
#include "lists/settle.h"
#include "values/value_type.h"

namespace tevpf {
namespace {

TEVPF_STATUS put_param(Sink& sink, const TEVPF_PARAM& param) noexcept {
  const TEVPF_PARAM_DEF& def = param.def;
  TEVPF_STATUS status = PF_NORMAL;
  std::int32_t part_bytes = 0;
  if (is_value_type(def.type)) {
    part_bytes = value_type(def.type).param_part;
  } else {
    status = fail(PF_BADTYPE, "parameter", Text(def.type));
  }
  constexpr std::size_t kHead = stored_size(kParamFields);
  static_assert(sizeof def.part <= Sink::kSlack);
  unsigned char* const place =
      sink.record(std::size_t{kHead} + static_cast<std::size_t>(part_bytes));
  pack<kParamFields>(&param, place);
  std::memcpy(place + kHead, &def.part, sizeof def.part);
  if (def.type == PF_TYPE_STRING) {
    sink.put(def.part.str.value, static_cast<std::uint64_t>(def.part.str.length) + 1);
  }
  if (def.description != nullptr) sink.put_text(def.description);
  return status;
}

}  // namespace

TEVPF_STATUS store_list(Sink& sink, TEVPF_LIST& list) noexcept {
  if (!settle(list)) return fail_empty(PF_NOMEM);
  sink.put(&list.header, sizeof list.header);
  put_fields<kListFields>(sink, &list);
  TEVPF_STATUS status = PF_NORMAL;
  for (std::int32_t i = 0; i < list.num_params; ++i) {
    const TEVPF_STATUS noted = put_param(sink, list.param_ptr[i]);
    if (noted != PF_NORMAL) status = noted;
  }
  if (status == PF_NORMAL) sink.put_numbers(list.index_ptr, list.num_params);
  return status;
}

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_store_list(std::FILE* stream, TEVPF_LIST* list) noexcept {
  return write_element(stream, list->header, list_kind);
}
