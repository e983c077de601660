#include "report_section.h"

#include "html.h"

namespace tool {

std::string section_begin(const Section& section) {
  const tevpf::Element& element = section.element;
  std::string text = "\n<section id=\"" + section.id + "\" aria-labelledby=\"" + section.id +
                     "-name\">\n<h2 id=\"" + section.id + "-name\"><span class=\"kind\">" +
                     (element.kind == tevpf::Kind::list ? "List" : "Table") + "</span> " +
                     html_text(element.name) + "</h2>\n";
  if (!element.description.empty()) text += "<p>" + html_text(element.description) + "</p>\n";
  return text;
}

std::string table_begin(const Section& section, const std::string& part, const std::string& caption,
                        const std::string& head, Rows rows) {
  const bool is_sortable = rows == Rows::kSortable;
  const std::string id = section.id + "-" + part;
  return std::string(is_sortable
                         ? "<p class=\"filter\" hidden><label>Filter <input type=\"search\" "
                           "autocomplete=\"off\"></label> <output></output></p>\n"
                         : "") +
         "<div class=\"pane\" role=\"region\" tabindex=\"0\" aria-labelledby=\"" + section.id +
         "-name " + id + "\"><table" + (is_sortable ? " class=\"sortable\"" : "") +
         ">\n<caption id=\"" + id + "\">" + caption + "</caption>\n<thead><tr>" + head +
         "</tr></thead>\n<tbody>\n";
}

std::string rows_caption(std::size_t shown, std::size_t all, const char* noun) {
  return (shown < all ? "The first " + grouped(shown) + " of " : "") + counted_in_groups(all, noun);
}

}  // namespace tool
