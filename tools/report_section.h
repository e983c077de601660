// The parts of a report: a section for each element, with tables in it that scroll by themselves.
#pragma once

#include <cstddef>
#include <string>

#include "output.h"
#include "tevpf.hpp"

namespace tool {

struct Section {
  const tevpf::File& file;
  const tevpf::Element& element;
  std::string id;         // in the page; ids of its parts start with it
  std::size_t most_rows;  // to show
};

void write_list_section(Output& output, const Section& section);
void write_table_section(Output& output, const Section& section);

// Down to the description of the element. The heading's id is heading_id(section).
std::string section_begin(const Section& section);
constexpr const char* kSectionEnd = "</section>\n";
std::string heading_id(const Section& section);

// A table down to the beginning of its body. Rows that can be sorted have a filter, too.
struct HtmlTable {
  std::string heading_id;  // of the heading above it
  std::string id;          // of its caption
  std::string caption, head;
  bool is_sortable = false;
};
std::string table_begin(const HtmlTable& table);
constexpr const char* kTableEnd = "</tbody>\n</table></div>\n";

// "118 rows" or "The first 100 of 118 rows".
std::string rows_caption(std::size_t shown, std::size_t all, const char* noun);

}  // namespace tool
