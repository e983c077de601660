#include "reports/list_dump.h"

#include <algorithm>
#include <cstring>

#include "core/library.h"
#include "lists/directory.h"
#include "lists/settle.h"
#include "reports/debug_text.h"
#include "reports/definition_text.h"
#include "reports/display.h"
#include "reports/escape.h"
#include "reports/report_file.h"

namespace tevpf {

namespace {

constexpr std::int32_t kValueField = 14;  // width of the field in which numbers are right-aligned
constexpr std::int32_t kStringWidth = 65;
constexpr char kStringIndent[] = "\t\t\t\t\t\t\t       ";  // up to the column where values start
constexpr std::int32_t kDescriptionWidth = 53;

// Escapes texts into a block that grows to fit the longest of them.
class EscapedText {
 public:
  // False when out of memory.
  [[nodiscard]] bool reserve(std::uint64_t length) noexcept {
    if (2 * length <= room_) return true;
    block_ = new_array<char>(2 * length);
    room_ = block_ ? 2 * length : 0;
    return block_ != nullptr;
  }
  std::string_view escape(std::string_view text) noexcept {
    const char* const end =
        write_escaped(block_.get(), text.data(), static_cast<std::int64_t>(text.size()));
    return {block_.get(), static_cast<std::size_t>(end - block_.get())};
  }

 private:
  Owned<char> block_;
  std::uint64_t room_ = 0;
};

class ListWriter {
 public:
  ListWriter(TextOut& out, const TEVPF_LIST& list) noexcept
      : out_(out), list_(list), has_descriptions_(any_description(list)) {}

  [[nodiscard]] bool reserve() noexcept { return escaped_.reserve(kFirstRoom); }
  void write_head() noexcept;
  [[nodiscard]] TEVPF_STATUS write_entry(const TEVPF_PARAM& param) noexcept;

 private:
  static constexpr std::uint64_t kFirstRoom = 132;

  static bool any_description(const TEVPF_LIST& list) noexcept {
    return std::any_of(list.param_ptr, list.param_ptr + list.num_params,
                       [](const TEVPF_PARAM& param) { return param.def.description != nullptr; });
  }
  void write_debug_fields() noexcept;
  template <class T>
  void write_number_value(const TEVPF_PARAM_DEF& def) noexcept;
  [[nodiscard]] TEVPF_STATUS write_string_value(const TEVPF_PARAM_DEF& def,
                                                FirstLine& description) noexcept;

  TextOut& out_;
  const TEVPF_LIST& list_;
  const bool has_descriptions_;
  EscapedText escaped_;
};

void ListWriter::write_head() noexcept {
  out_.print(" List name:  ", list_.header.elem_name, '\n');
  out_.print(" Description:  ", list_.header.elem_desc, '\n');
  out_.print(".Number of parameters:  ", list_.num_params, "\n\n");
  if (library.debug_value != nullptr) write_debug_fields();
  out_.print("\n\n.\t\t\t\t   LIST DATA\n\n");
  out_.print("\tNAME          UNITS  TYPE PREC     MAX         MIN          VALUE");
  if (has_descriptions_) out_.print("              DESCRIPTION");
  out_.print("\n.", Repeat{'-', has_descriptions_ ? 112 : 79}, "\n\n");
}

void ListWriter::write_debug_fields() noexcept {
  out_.print("btf = ", list_.header.btf, '\n');
  out_.print("RESERVED = ", list_.RESERVED, '\n');
  out_.print("cur_param = ", list_.cur_param, '\n');
  out_.print("index_ptr = ", address_of(list_.index_ptr), '\n');
  out_.print("free_params = ", list_.free_params, '\n');
  write_index_entries(out_, list_.index_ptr, list_.num_params);
}

template <class T>
void ListWriter::write_number_value(const TEVPF_PARAM_DEF& def) noexcept {
  const auto& part = number_part<T>(def);
  write_bounds<T>(out_, def.type, part, 10);
  out_.print(' ');
  std::int32_t digits = 0;
  if constexpr (kIsFloating<T>) digits = part.precision;
  write_number<T>(out_, part.value, kValueField, digits);
  out_.print("  ");
}

// After the value and before a description: blanks up to its field, or the start of a new line.
TEVPF_STATUS ListWriter::write_string_value(const TEVPF_PARAM_DEF& def,
                                            FirstLine& description) noexcept {
  const std::string_view text = def.part.str.value;
  write_no_bounds(out_, 10);
  out_.print("  ");
  if (!escaped_.reserve(text.size())) return fail_empty(PF_NOMEM);
  const std::string_view escaped = escaped_.escape(text);
  write_wrapped(out_, FirstLine::kGoesOn, kStringWidth, escaped, kStringIndent);
  if (has_descriptions_ || (!escaped.empty() && escaped.back() == ' ')) out_.print("\\0 ");
  if (def.description == nullptr) return PF_NORMAL;
  const std::int64_t length = def.part.str.length;
  if (length + 2 > 13) {
    out_.print("\\\n");
    description = FirstLine::kIndented;
  } else {
    out_.print(Repeat{' ', 12 - length});
  }
  return PF_NORMAL;
}

TEVPF_STATUS ListWriter::write_entry(const TEVPF_PARAM& param) noexcept {
  const TEVPF_PARAM_DEF& def = param.def;
  FirstLine description = FirstLine::kGoesOn;
  write_name_and_units(out_, def.name, def.units);
  if (is_value_type(def.type)) out_.print(type_text(def.type).word, ' ');
  if (def.type == PF_TYPE_STRING) {
    PF_TRY(write_string_value(def, description));
  } else if (is_number_type(def.type)) {
    with_number(def.type, [&](auto tag) { write_number_value<decltype(tag)>(def); });
  } else {
    out_.print("Invalid type, ", def.type, '\n');
  }

  if (def.description != nullptr) {
    write_wrapped(out_, description, kDescriptionWidth, def.description, kDescriptionIndent);
  } else if (has_descriptions_) {
    out_.print(kNoValue);
  }
  out_.print('\n');
  if (library.debug_value != nullptr) out_.print("desc loc = ", param.desc_loc, '\n');
  return PF_NORMAL;
}

}  // namespace

TEVPF_STATUS write_list(TextOut& out, TEVPF_LIST& list) noexcept {
  if (!settle(list)) return fail_empty(PF_NOMEM);
  ListWriter writer(out, list);
  if (!writer.reserve()) return fail_empty(PF_NOMEM);
  writer.write_head();
  for (std::int32_t pos = 0; pos < list.num_params; ++pos) {
    PF_TRY(writer.write_entry(list.param_ptr[pos]));
  }
  return PF_NORMAL;
}

}  // namespace tevpf

using namespace tevpf;

TEVPF_STATUS TEV8R1_list_dump(TEVPF_LIST* list, std::FILE* stream) noexcept {
  TextOut out(stream);
  return write_list(out, *list);
}

TEVPF_STATUS TEV8R1_PF_dump_list(const char* name, const char* path) noexcept {
  return write_report(path, [&](TextOut& out) -> TEVPF_STATUS {
    TEVPF_LIST* list = nullptr;
    PF_TRY(find_list(name, list));
    return write_list(out, *list);
  });
}
