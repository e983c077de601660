// The section of a list: its parameters, and where their values lie within the bounds.
#include <algorithm>

#include "figures.h"
#include "html.h"
#include "report_section.h"
#include "values.h"

namespace tool {
namespace {

const char* const kHead =
    "<th scope=\"col\">Name</th>"
    "<th scope=\"col\" class=\"n\">Value</th>"
    "<th scope=\"col\">Units</th>"
    "<th scope=\"col\" class=\"n\">Min</th>"
    "<th scope=\"col\" class=\"plain\">Within</th>"
    "<th scope=\"col\" class=\"n\">Max</th>"
    "<th scope=\"col\">Description</th>";

// The bar between the bounds, for values that have both of them.
std::string place_of(const tevpf::Parameter& p) {
  if (!p.bounds() || is_nan(p.value())) return {};
  const tevpf::Bounds& bounds = *p.bounds();
  if (p.value() < bounds.min) return "<span class=\"out\">below the minimum</span>";
  if (p.value() > bounds.max) return "<span class=\"out\">above the maximum</span>";
  const double min = as_number(bounds.min), max = as_number(bounds.max);
  if (!has_min(bounds) || !has_max(bounds) || !(min < max)) return {};
  return bounds_figure(as_number(p.value()), min, max, bounds_text(bounds, p.units()));
}

std::string row_of(const tevpf::Parameter& p) {
  static const std::string kNoBound = html_cell("");
  const bool from = p.bounds() && has_min(*p.bounds());
  const bool to = p.bounds() && has_max(*p.bounds());
  return "<tr><th scope=\"row\">" + html_text(p.name()) + "</th>" +
         html_cell(p.value(), p.precision()) + html_cell(p.units()) +
         (from ? html_cell(p.bounds()->min, p.precision()) : kNoBound) + "<td>" + place_of(p) +
         "</td>" + (to ? html_cell(p.bounds()->max, p.precision()) : kNoBound) +
         html_cell(p.description()) + "</tr>\n";
}

}  // namespace

void write_list_section(Output& output, const Section& section) {
  const tevpf::List list = section.file.list(section.element.name);
  const std::size_t size = list.size();
  const std::size_t shown = std::min(size, section.most_rows);
  const std::string caption = rows_caption(shown, size, "parameter");
  output.write(section_begin(section));
  if (shown == 0) {
    output.write("<p class=\"none\">" + caption + "</p>\n" + kSectionEnd);
    return;
  }
  output.write(table_begin({heading_id(section), section.id + "-rows", caption, kHead, true}));
  for (std::size_t i = 0; i < shown; ++i) output.write(row_of(list.at(i)));
  output.write(std::string(kTableEnd) + kSectionEnd);
}

}  // namespace tool
