// The section of a table: what is known of its columns, and its first rows.
#include <algorithm>
#include <cmath>
#include <vector>

#include "figures.h"
#include "html.h"
#include "report_section.h"
#include "statistics.h"
#include "values.h"

namespace tool {
namespace {

const char* const kColumnsHead =
    "<th scope=\"col\">Column</th><th scope=\"col\">Type</th><th scope=\"col\">Units</th>"
    "<th scope=\"col\">Bounds</th><th scope=\"col\" class=\"n\">Values</th>"
    "<th scope=\"col\" class=\"n\">Missing</th><th scope=\"col\" class=\"n\">Smallest</th>"
    "<th scope=\"col\" class=\"n\">Largest</th><th scope=\"col\" class=\"n\">Mean</th>"
    "<th scope=\"col\">Distribution</th><th scope=\"col\">Description</th>";

bool is_text(const tevpf::Column& column) { return column.type() == Type::string; }

// Calls f(column's place, number) for all values. Of a text the number is 0, of an empty one none.
template <class F>
void for_each_number(const tevpf::Table& table, const std::vector<tevpf::Column>& columns, F&& f) {
  for (const tevpf::RowView row : table) {
    for (std::size_t c = 0; c < columns.size(); ++c) {
      if (is_text(columns[c])) {
        f(c, row.get<std::string_view>(c).empty() ? std::nan("") : 0);
      } else {
        f(c, as_number(row.value(c)));
      }
    }
  }
}

std::vector<Summary> summaries_of(const tevpf::Table& table,
                                  const std::vector<tevpf::Column>& columns) {
  std::vector<Summary> result(columns.size());
  for_each_number(table, columns, [&](std::size_t c, double number) { result[c].add(number); });
  return result;
}

std::vector<Histogram> histograms_of(const tevpf::Table& table,
                                     const std::vector<tevpf::Column>& columns,
                                     const std::vector<Summary>& summaries) {
  std::vector<Histogram> result;
  for (std::size_t c = 0; c < columns.size(); ++c) {
    result.emplace_back(summaries[c].low(), summaries[c].high(), !is_floating(columns[c].type()));
  }
  for_each_number(table, columns, [&](std::size_t c, double number) { result[c].add(number); });
  return result;
}

// A number of a column as its values are shown. Integers are exact in a double.
std::string shown(double number, const tevpf::Column& column) {
  return is_floating(column.type()) ? display_text(number, column.precision())
                                    : std::to_string(std::llround(number));
}

// That of integers gets two digits more than they have themselves.
std::string mean_of(const Summary& summary, const tevpf::Column& column) {
  if (!std::isfinite(summary.mean())) return {};
  if (is_floating(column.type())) return display_text(summary.mean(), column.precision());
  const double largest = std::max(std::abs(summary.low()), std::abs(summary.high()));
  const auto digits = static_cast<std::int32_t>(shown(largest, column).size());
  return display_text(summary.mean(), digits + 2);
}

std::string number_cell(const std::string& text) { return "<td class=\"n\">" + text + "</td>"; }

std::string column_row(const tevpf::Column& column, const Summary& summary,
                       const Histogram& histogram) {
  const bool has_numbers = !is_text(column) && summary.count() > 0;
  std::string smallest, largest, mean, distribution;
  if (has_numbers) {
    smallest = shown(summary.smallest(), column);
    largest = shown(summary.largest(), column);
    mean = mean_of(summary, column);
  }
  if (has_numbers && summary.low() <= summary.high()) {
    distribution = histogram_figure(
        histogram, shown(summary.low(), column) + " to " + shown(summary.high(), column));
  }
  const char* const index = column.is_unique()    ? ", unique"
                            : column.is_indexed() ? ", indexed"
                                                  : "";
  return "<tr><th scope=\"row\">" + html_text(column.name()) + "</th>" +
         html_cell(tevpf::to_string(column.type()) + std::string(index)) +
         html_cell(column.units()) + html_cell(bounds_text(column.bounds(), {})) +
         number_cell(grouped(summary.count())) + number_cell(grouped(summary.missing())) +
         number_cell(smallest) + number_cell(largest) + number_cell(mean) + "<td>" + distribution +
         "</td>" + html_cell(column.description()) + "</tr>\n";
}

void write_columns(Output& output, const Section& section, const tevpf::Table& table,
                   const std::vector<tevpf::Column>& columns) {
  const std::vector<Summary> summaries = summaries_of(table, columns);
  const std::vector<Histogram> histograms = histograms_of(table, columns, summaries);
  output.write(table_begin({heading_id(section), section.id + "-columns",
                            counted_in_groups(columns.size(), "column"), kColumnsHead}));
  for (std::size_t c = 0; c < columns.size(); ++c) {
    output.write(column_row(columns[c], summaries[c], histograms[c]));
  }
  output.write(kTableEnd);
}

void write_rows(Output& output, const Section& section, const tevpf::Table& table,
                const std::vector<tevpf::Column>& columns) {
  const std::size_t count = std::min(table.size(), section.most_rows);
  const std::string caption = rows_caption(count, table.size(), "row");
  if (count == 0) {
    output.write("<p class=\"none\">" + caption + "</p>\n");
    return;
  }
  std::string head = "<th scope=\"col\" class=\"n\">Row</th>";
  for (const tevpf::Column& column : columns) {
    head += html_heading(column.name(), column.units(), !is_text(column));
  }
  output.write(table_begin({heading_id(section), section.id + "-rows", caption, head, true}));
  std::size_t number = 0;
  for (const tevpf::RowView row : table) {
    if (++number > count) break;
    std::string line =
        "<tr><th scope=\"row\" class=\"n number\">" + std::to_string(number) + "</th>";
    for (std::size_t c = 0; c < columns.size(); ++c) {
      line += html_cell(row.value(c), columns[c].precision());
    }
    output.write(line += "</tr>\n");
  }
  output.write(kTableEnd);
}

}  // namespace

void write_table_section(Output& output, const Section& section) {
  const tevpf::Table table = section.file.table(section.element.name);
  const std::vector<tevpf::Column> columns = table.columns();
  output.write(section_begin(section));
  if (columns.empty()) {
    output.write("<p class=\"none\">0 columns</p>\n");
  } else {
    write_columns(output, section, table, columns);
    write_rows(output, section, table, columns);
  }
  output.write(kSectionEnd);
}

}  // namespace tool
