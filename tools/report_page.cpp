#include "report_page.h"

#include <array>
#include <chrono>
#include <cstdio>
#include <filesystem>
#include <string>
#include <system_error>
#include <vector>

#include "files.h"
#include "html.h"
#include "page_texts.h"
#include "report_section.h"
#include "text.h"

namespace fs = std::filesystem;

namespace tool {
namespace {

using Elements = std::vector<tevpf::Element>;

const char* const kContentsHead =
    "<th scope=\"col\">Name</th><th scope=\"col\">Kind</th><th scope=\"col\">Size</th>"
    "<th scope=\"col\">Description</th>";

// The page may load nothing, and runs no style or script but its own.
void write_head(Output& output, const std::string& title) {
  const auto own = [](std::string_view hash) { return "'sha256-" + std::string(hash) + "'"; };
  output.write(
      "<!DOCTYPE html>\n<html lang=\"en\">\n<head>\n<meta charset=\"utf-8\">\n"
      "<meta http-equiv=\"Content-Security-Policy\" content=\"default-src 'none'; img-src data:; "
      "style-src " +
      own(kPageStyleHash) + "; script-src " + own(kPageScriptHash) +
      "; base-uri 'none'; form-action 'none'\">\n"
      "<meta name=\"viewport\" content=\"width=device-width, initial-scale=1\">\n"
      "<meta name=\"color-scheme\" content=\"light dark\">\n<link rel=\"icon\" href=\"data:,\">\n"
      "<title>" +
      title + "</title>\n<style>" + std::string(kPageStyle) + "</style>\n</head>\n<body>\n");
}

// "2026-11-23 12:54 UTC"; empty when it cannot be had.
std::string last_change(const std::string& path) {
  namespace chrono = std::chrono;
  std::error_code error;
  const fs::file_time_type time = fs::last_write_time(path_of(path), error);
  if (error) return {};
  const auto minute = chrono::floor<chrono::minutes>(chrono::file_clock::to_sys(time));
  const auto day = chrono::floor<chrono::days>(minute);
  const chrono::year_month_day date(day);
  const chrono::hh_mm_ss clock(minute - day);
  std::array<char, 64> buffer;
  const int length = std::snprintf(
      buffer.data(), buffer.size(), "%04d-%02u-%02u %02d:%02d UTC", static_cast<int>(date.year()),
      static_cast<unsigned>(date.month()), static_cast<unsigned>(date.day()),
      static_cast<int>(clock.hours().count()), static_cast<int>(clock.minutes().count()));
  return {buffer.data(), static_cast<std::size_t>(length)};
}

void write_title(Output& output, const tevpf::File& file, const std::string& title,
                 const Elements& elements) {
  const auto lists = static_cast<std::size_t>(
      std::count_if(elements.begin(), elements.end(),
                    [](const tevpf::Element& e) { return e.kind == tevpf::Kind::list; }));
  const std::string changed = last_change(file.name());
  output.write("<header>\n<h1>" + title + "</h1>\n<p class=\"facts\">Parameter file with " +
               counted_in_groups(lists, "list") + " and " +
               counted_in_groups(elements.size() - lists, "table") + ", " +
               counted_in_groups(size_on_disk(file), "byte") +
               (changed.empty() ? "" : ", last changed " + changed) + "</p>\n");
  if (file.damage()) {
    output.write("<p class=\"damage\">The file is damaged: " + html_text(damage_of(file)) +
                 ". Shown is what could be read.</p>\n");
  }
  output.write("</header>\n");
}

std::string size_of(const tevpf::File& file, const tevpf::Element& element) {
  if (element.kind == tevpf::Kind::list) {
    return counted_in_groups(file.list(element.name).size(), "parameter");
  }
  const tevpf::Table table = file.table(element.name);
  return counted_in_groups(table.size(), "row") + ", " +
         counted_in_groups(table.columns().size(), "column");
}

void write_contents(Output& output, const tevpf::File& file, const std::vector<Section>& sections) {
  output.write(
      "<nav aria-labelledby=\"contents\">\n<h2 id=\"contents\">Contents</h2>\n" +
      table_begin({"contents", "contents-rows", "Lists and tables of the file", kContentsHead}));
  for (const Section& section : sections) {
    const tevpf::Element& element = section.element;
    output.write("<tr><th scope=\"row\"><a href=\"#" + section.id + "\">" +
                 html_text(element.name) + "</a></th>" +
                 html_cell(element.kind == tevpf::Kind::list ? "list" : "table") +
                 html_cell(size_of(file, element)) + html_cell(element.description) + "</tr>\n");
  }
  output.write(std::string(kTableEnd) + "</nav>\n");
}

}  // namespace

void write_page(Output& output, const tevpf::File& file, std::size_t most_rows) {
  const Elements elements = file.elements();
  std::vector<Section> sections;
  for (const tevpf::Element& element : elements) {
    sections.push_back({file, element, "e" + std::to_string(sections.size() + 1), most_rows});
  }
  const std::string title = html_text(name_of(path_of(file.name()).filename()));
  write_head(output, title);
  write_title(output, file, title, elements);
  output.write("<main>\n");
  if (!sections.empty()) write_contents(output, file, sections);
  for (const Section& section : sections) {
    section.element.kind == tevpf::Kind::list ? write_list_section(output, section)
                                              : write_table_section(output, section);
  }
  output.write(
      "</main>\n<footer><p>Numbers have the digits that their precision asks for; point at one to "
      "see all of its digits. Missing are what is not a number (nan) and empty texts. Made by "
      "tevpf report.</p></footer>\n<script>" +
      std::string(kPageScript) + "</script>\n</body>\n</html>\n");
}

}  // namespace tool
