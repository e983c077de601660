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
  std::string id;         // in the page, and the beginning of other ids
  std::size_t most_rows;  // to show
};

void write_list_section(Output& output, const Section& section);
void write_table_section(Output& output, const Section& section);

// Kind, name and description, and what closes the section.
std::string section_begin(const Section& section);
constexpr const char* kSectionEnd = "</section>\n";

// A table in its pane, down to its head; `head`: the headings, `part`: its id within the section.
// Sortable ones have a filter in front.
enum class Rows { kFixed, kSortable };
std::string table_begin(const Section& section, const std::string& part, const std::string& caption,
                        const std::string& head, Rows rows);
constexpr const char* kTableEnd = "</tbody>\n</table></div>\n";

// "118 rows" or "The first 100 of 118 rows".
std::string rows_caption(std::size_t shown, std::size_t all, const char* noun);

}  // namespace tool
