#include "html.h"

#include "text.h"

namespace tool {
namespace {

// Narrow and unbreakable.
constexpr std::string_view kGroupSpace = "\u202F";

std::string_view entity(char character) {
  switch (character) {
    case '&':
      return "&amp;";
    case '<':
      return "&lt;";
    case '>':
      return "&gt;";
    case '"':
      return "&quot;";
    case '\'':
      return "&#39;";
    default:
      return {};
  }
}

}  // namespace

std::string html_text(std::string_view text) {
  std::string result;
  result.reserve(text.size());
  for (const char character : visible(text)) {
    if (const std::string_view name = entity(character); !name.empty()) {
      result += name;
    } else {
      result += character;
    }
  }
  return result;
}

std::string html_tag(std::string_view name, std::initializer_list<HtmlAttribute> attributes) {
  std::string tag = "<";
  tag += name;
  for (const HtmlAttribute& attribute : attributes) {
    tag += ' ';
    tag += attribute.name;
    tag += "=\"" + attribute.value + '"';
  }
  return tag += '>';
}

std::string html_cell(std::string_view text) { return "<td>" + html_text(text) + "</td>"; }

std::string html_cell(const Value& value, std::int32_t precision) {
  if (const auto* text = std::get_if<std::string>(&value)) return html_cell(*text);
  const std::string shown = display_text(value, precision);
  const std::string exact = exact_text(value);
  const std::string begin = is_nan(value)    ? html_tag("td", {{"class", "n none"}})
                            : shown == exact ? html_tag("td", {{"class", "n"}})
                                             : html_tag("td", {{"class", "n"}, {"title", exact}});
  return begin + shown + "</td>";
}

std::string grouped(std::uintmax_t count) {
  const std::string digits = std::to_string(count);
  std::string result;
  for (std::size_t i = 0; i < digits.size(); ++i) {
    if (i > 0 && (digits.size() - i) % 3 == 0) result += kGroupSpace;
    result += digits[i];
  }
  return result;
}

std::string counted_in_groups(std::uintmax_t count, std::string_view noun) {
  std::string result = grouped(count) + " ";
  result += noun;
  if (count != 1) result += 's';
  return result;
}

std::string html_heading(std::string_view name, std::string_view units, bool is_number) {
  const std::string unit = units.empty() ? ""
                                         : " " + html_tag("span", {{"class", "unit"}}) + "[" +
                                               html_text(units) + "]</span>";
  const std::string begin = is_number ? html_tag("th", {{"scope", "col"}, {"class", "n"}})
                                      : html_tag("th", {{"scope", "col"}});
  return begin + html_text(name) + unit + "</th>";
}

}  // namespace tool
