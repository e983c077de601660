// Dumps a whole file as text: its header values, then every list, then every table.
#include <cstring>

#include "core/file.h"
#include "core/library.h"
#include "lists/directory.h"
#include "lists/param_store.h"
#include "reports/definition_text.h"
#include "reports/display.h"
#include "reports/list_dump.h"
#include "reports/report_file.h"
#include "reports/table_dump.h"
#include "tables/directory.h"

namespace tevpf {

namespace {

constexpr char kHeaderList[] = "TEVPF_FILE_HEADER";  // its parameters describe the file
constexpr std::int32_t kHeaderWidth = 90;
constexpr char kHeaderIndent[] = "\t\t\t\t      ";  // up to the column where header values start
constexpr char kElementEnd[] = "!\n\f\n";

void write_header_value(TextOut& out, const TEVPF_PARAM_DEF& def) noexcept {
  out.print("*\t\t", LeftText{field_text(def.name), 20}, ": ");
  if (def.type == PF_TYPE_STRING) {
    write_wrapped(out, FirstLine::kGoesOn, kHeaderWidth, def.part.str.value, kHeaderIndent);
  } else if (is_number_type(def.type)) {
    with_number(def.type, [&](auto tag) {
      using T = decltype(tag);
      write_number<T>(out, number_part<T>(def).value, 0, kDefaultPrecision);
    });
  }
  out.print("\n\n");
}

void write_file_block(TextOut& out, const TEVPF_FILE& file) noexcept {
  out.print("\t\tFile name           : ", file.file_name, "\n\n");
  out.print(".\t\tNumber of lists     : ", directory_of(file, PF_ELEM_LIST).count, "\n\n");
  out.print(".\t\tNumber of tables    : ", directory_of(file, PF_ELEM_TABLE).count, "\n\n");
  TEVPF_LIST* header = nullptr;
  if (find_list(kHeaderList, header) == PF_NORMAL) {
    for (std::int32_t pos = 0; pos < header->num_params; ++pos) {
      write_header_value(out, param_at(*header, pos).def);
    }
  }
  out.print("\f\n");
}

TEVPF_STATUS write_file(TextOut& out, const TEVPF_FILE& file) noexcept {
  write_file_block(out, file);
  TEVPF_STATUS status = PF_NORMAL;
  const std::int32_t num_lists = directory_of(file, PF_ELEM_LIST).count;
  for (std::int32_t n = 0; n < num_lists && status == PF_NORMAL; ++n) {
    TEVPF_LIST& list = list_at(file, n);
    if (std::strcmp(list.header.elem_name, kHeaderList) == 0) continue;
    status = write_list(out, list);
    out.print(kElementEnd);
  }
  const std::int32_t num_tables = directory_of(file, PF_ELEM_TABLE).count;
  for (std::int32_t n = 0; n < num_tables && status == PF_NORMAL; ++n) {
    status = write_table(out, table_at(file, n));
    out.print(kElementEnd);
  }
  return status;
}

}  // namespace

}  // namespace tevpf

TEVPF_STATUS TEV8R1_PF_dump_file(const char* path) noexcept {
  using namespace tevpf;
  if (library.num_files == 0) return PF_NOFILE;
  return write_report(path, [](TextOut& out) { return write_file(out, *library.current_file); });
}
