#include "row_values.h"

#include "text.h"

namespace tool {

void set_cell(tevpf::Row& row, const Columns& columns, const std::string& column,
              const std::string& text, const Subject& subject) {
  const std::size_t position = columns.position_of(column);
  const tevpf::Column& definition = columns[position];
  const Subject cell{subject.name, subject.outcome + ": column " + in_quotes(column)};
  if (definition.type() == Type::string) {
    const auto width = static_cast<std::size_t>(definition.width());
    if (text.size() > width) {
      cell.refuse("the text has " + counted(text.size(), "byte") + ", the column holds " +
                  std::to_string(width));
    }
    row.set(position, text);
    return;
  }
  const bool is_missing =
      is_floating(definition.type()) && !definition.is_indexed() && (text.empty() || text == "nan");
  Value value;
  if (is_missing) {
    parse_value(definition.type(), "nan", value);
  } else {
    value = value_within(definition, text, cell);
  }
  row.set(position, value);
}

}  // namespace tool
