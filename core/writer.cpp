#include "core/writer.h"

#include "core/base/status.h"
#include "core/file.h"
#include "core/io/sink.h"

namespace tevpf {
namespace {

TEVPF_STATUS put_elements(Sink& sink, const TEVPF_FILE& file) noexcept {
  for (std::int32_t type = 1; type <= kNumKinds; ++type) {
    const Directory& directory = directory_of(file, type);
    for (std::int32_t i = 0; i < directory.count; ++i) {
      PF_TRY(kind_of(type).write(sink, *directory.entries[i]));
    }
  }
  return PF_NORMAL;
}

// Writes with `put` and flushes the sink, even after a record that could not be stored.
template <class Put>
TEVPF_STATUS write_through_sink(std::FILE* stream, const char* name, Put put) noexcept {
  Sink sink(stream);
  const TEVPF_STATUS status = put(sink);
  const bool written = sink.finish() && std::fflush(stream) == 0;
  return status == PF_NORMAL && !written ? fail(PF_OPENFAIL, name) : status;
}

}  // namespace

TEVPF_STATUS write_elements(const TEVPF_FILE& file, std::FILE* stream, const char* name) noexcept {
  return write_through_sink(stream, name, [&](Sink& sink) { return put_elements(sink, file); });
}

TEVPF_STATUS write_element(std::FILE* stream, TEVPF_ELEM_HEADER& element,
                           const ElementKind& kind) noexcept {
  return write_through_sink(stream, element.elem_name,
                            [&](Sink& sink) { return kind.write(sink, element); });
}

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_store_file(TEVPF_FILE* file) noexcept {
  if (file->fp == nullptr) return fail(PF_OPENFAIL, file->file_name);
  return write_elements(*file, file->fp, file->file_name);
}
