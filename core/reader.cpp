// Loads a file in one pass, element by element.
#include "core/reader.h"

#include "core/base/status.h"
#include "core/base/text_field.h"
#include "core/file.h"
#include "core/io/input.h"

namespace tevpf {

namespace {

constexpr std::int32_t kFirstScratch = 4096;

// A block for the body of the element being read; replaced only by larger ones.
struct Scratch {
  Owned<unsigned char> block;
  std::int32_t room = 0;
};

// Reads the body of the current element into the scratch block.
Input::Got read_body(Input& input, std::int32_t bytes, Scratch& scratch) noexcept {
  if (bytes > scratch.room) {
    const Input::Got got = input.read_block(static_cast<std::uint32_t>(bytes), scratch.block);
    if (got == Input::Got::kAll) scratch.room = bytes;
    return got;
  }
  const auto count = static_cast<std::uint64_t>(bytes);
  return input.read(scratch.block.get(), count) == count ? Input::Got::kAll : Input::Got::kPart;
}

// Loads the element whose header was read last.
TEVPF_STATUS load_element(const TEVPF_ELEM_HEADER& header, Input& input,
                          Scratch& scratch) noexcept {
  if (!is_element_type(header.elem_type)) {
    return fail(PF_BADTYPE, {"element", header.elem_name}, Text(header.elem_type));
  }
  const ElementKind& kind = kind_of(header.elem_type);
  if (header.btf < kind.smallest_body) return fail(PF_BADFORMAT, header.elem_name);
  // A streamed body needs no block, but the file must contain all of it.
  const auto bytes = static_cast<std::uint32_t>(header.btf);
  if (kind.streams_body && input.weigh(bytes) == Input::Claim::kFits) {
    return kind.read(header, Body(input, header.btf), input);
  }
  switch (read_body(input, header.btf, scratch)) {
    case Input::Got::kPart:
      return fail(PF_BADFORMAT, header.elem_name);
    case Input::Got::kNoMemory:
      return fail_empty(PF_NOMEM);
    case Input::Got::kAll:
      break;
  }
  return kind.read(header, Body(scratch.block.get(), header.btf), input);
}

// Loads elements until the stream ends at an element boundary.
TEVPF_STATUS load_elements(Input& input) noexcept {
  Scratch scratch{new_array<unsigned char>(kFirstScratch), kFirstScratch};
  if (!scratch.block || !input.read_ahead()) return fail_empty(PF_NOMEM);
  for (;;) {
    TEVPF_ELEM_HEADER header = {};
    const std::uint64_t got = input.read(&header, sizeof header);
    terminate_texts(header);
    if (got == 0) return PF_NORMAL;
    if (got != sizeof header) return fail(PF_BADFORMAT, header.elem_name);
    PF_TRY(load_element(header, input, scratch));
  }
}

// Closes a file that could not be read, or not to its end.
TEVPF_STATUS give_up(TEVPF_FILE& file, TEVPF_STATUS reason) noexcept {
  const TEVPF_STATUS status = fail(reason, file.file_name);
  file.new_file = 0;
  TEV8R1_PF_close(0);
  return status;
}

}  // namespace

void terminate_texts(TEVPF_ELEM_HEADER& header) noexcept {
  terminate_field(header.elem_name);
  terminate_field(header.elem_desc);
}

TEVPF_STATUS load_file(TEVPF_FILE& file) noexcept {
  Input input(file.fp);
  const TEVPF_STATUS status = load_elements(input);
  // A read error: the elements read may be only part of the file and must not be saved over it.
  if (input.has_failed()) return give_up(file, PF_OPENFAIL);
  if (status == PF_NORMAL) {
    file.new_file = 0;
  } else if (status == PF_BADFORMAT || status == PF_BADTYPE) {
    PF_TRY(TEV8R1_check_valid_file(&file));
  }
  return status;
}

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_check_valid_file(TEVPF_FILE* file) noexcept {
  for (const Directory& directory : file->directories) {
    if (directory.count > 0) return PF_NORMAL;
  }
  return give_up(*file, PF_BADFILE);
}
