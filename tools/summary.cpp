#include "summary.h"

#include "json.h"
#include "text_table.h"
#include "values.h"

namespace tool {
namespace {

// Missing is what is not a number, and an empty text.
struct Summary {
  std::size_t count = 0, missing = 0;
  std::optional<Value> smallest, largest;
  std::optional<double> mean;  // of numbers
};

bool is_missing(const Value& value) {
  const auto* text = std::get_if<std::string>(&value);
  return text != nullptr ? text->empty() : is_nan(value);
}

// The mean moves by each value's share, so that no sum can grow beyond all bounds.
void take(Summary& summary, const Value& value) {
  if (is_missing(value)) {
    ++summary.missing;
    return;
  }
  ++summary.count;
  if (!summary.smallest || value < *summary.smallest) summary.smallest = value;
  if (!summary.largest || *summary.largest < value) summary.largest = value;
  if (std::holds_alternative<std::string>(value)) return;
  const double number = as_number(value);
  const auto count = static_cast<double>(summary.count);
  const double mean = summary.mean.value_or(0);
  summary.mean = mean == number ? mean : mean + number / count - mean / count;
}

std::vector<Summary> summaries(const tevpf::Table& table, const Selection& selection) {
  std::vector<Summary> result(selection.columns.size());
  for (const std::size_t number : selection.rows) {
    const tevpf::Row row = table.row(number);
    for (std::size_t i = 0; i < result.size(); ++i)
      take(result[i], row.value(selection.columns[i]));
  }
  return result;
}

void write_json(Output& output, const Selection& selection, const std::vector<Summary>& all) {
  std::string text;
  JsonLines lines(text);
  for (std::size_t i = 0; i < all.size(); ++i) {
    const auto value = [](const std::optional<Value>& v) { return v ? value_json(*v) : "null"; };
    JsonObject json;
    json.add_text("column", selection.all[selection.columns[i]].name());
    json.add("count", std::to_string(all[i].count));
    json.add("missing", std::to_string(all[i].missing));
    json.add("smallest", value(all[i].smallest));
    json.add("largest", value(all[i].largest));
    json.add("mean", all[i].mean ? value_json(*all[i].mean) : "null");
    lines.add(json.text());
  }
  lines.finish();
  output.write(text + "\n");
}

}  // namespace

void show_summary(Output& output, const tevpf::Table& table, const Selection& selection,
                  bool as_json) {
  const std::vector<Summary> all = summaries(table, selection);
  if (as_json) return write_json(output, selection, all);
  TextTable text;
  text.add_column("column", TextTable::Align::kLeft);
  text.add_column("units", TextTable::Align::kLeft);
  for (const char* heading : {"count", "missing", "smallest", "largest", "mean"}) {
    text.add_column(heading, TextTable::Align::kRight);
  }
  static constexpr std::int32_t kDigitsOfMean = 6;
  text.write(output, all.size(), [&](std::size_t row, std::size_t column) -> std::string {
    const Summary& summary = all[row];
    const tevpf::Column& definition = selection.all[selection.columns[row]];
    const auto shown = [&](const std::optional<Value>& value) {
      return value ? display_text(*value, definition.precision()) : "";
    };
    switch (column) {
      case 0:
        return definition.name();
      case 1:
        return definition.units();
      case 2:
        return std::to_string(summary.count);
      case 3:
        return std::to_string(summary.missing);
      case 4:
        return shown(summary.smallest);
      case 5:
        return shown(summary.largest);
      default:
        return summary.mean
                   ? display_text(*summary.mean, std::max(definition.precision(), kDigitsOfMean))
                   : "";
    }
  });
}

}  // namespace tool
