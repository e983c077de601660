#include "report_section.h"

#include "html.h"

namespace tool {
namespace {

// The script shows it.
constexpr const char* kFilter =
    "<p class=\"filter\" hidden><label>Filter <input type=\"search\" autocomplete=\"off\"></label> "
    "<output></output></p>\n";

}  // namespace

std::string heading_id(const Section& section) { return section.id + "-name"; }

std::string section_begin(const Section& section) {
  const tevpf::Element& element = section.element;
  const bool is_list = element.kind == tevpf::Kind::list;
  std::string text = "\n" +
                     html_tag("section", {{"id", section.id},
                                          {"class", is_list ? "list" : "table"},
                                          {"aria-labelledby", heading_id(section)}}) +
                     "\n" + html_tag("h2", {{"id", heading_id(section)}}) +
                     "<span class=\"kind\">" + (is_list ? "List" : "Table") + "</span> " +
                     html_text(element.name) + "</h2>\n";
  if (!element.description.empty()) text += "<p>" + html_text(element.description) + "</p>\n";
  return text;
}

std::string table_begin(const HtmlTable& table) {
  return (table.is_sortable ? kFilter : "") +
         html_tag("div", {{"class", "pane"},
                          {"role", "region"},
                          {"tabindex", "0"},
                          {"aria-labelledby", table.heading_id + " " + table.id}}) +
         (table.is_sortable ? "<table class=\"sortable\">\n" : "<table>\n") +
         html_tag("caption", {{"id", table.id}}) + table.caption + "</caption>\n<thead><tr>" +
         table.head + "</tr></thead>\n<tbody>\n";
}

std::string rows_caption(std::size_t shown, std::size_t all, const char* noun) {
  return (shown < all ? "The first " + grouped(shown) + " of " : "") + counted_in_groups(all, noun);
}

}  // namespace tool
