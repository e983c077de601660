#include "transfer.h"

#include "index_order.h"

namespace tool {
namespace {

void transfer_list(const tevpf::List& source, tevpf::List target) {
  for (const tevpf::Parameter& parameter : source) target.add(parameter);
}

void transfer_table(const tevpf::Table& source, tevpf::Table target) {
  const std::vector<tevpf::Column> columns = source.columns();
  add_columns(target, columns, display_width_of(source));
  for (const tevpf::RowView row : source) target.append(tevpf::Row(row));
  for (const tevpf::Column& column : columns) {
    restore_order(target, column, order_to_keep(source, column));
  }
}

}  // namespace

void transfer(const tevpf::File& from, const tevpf::Element& element, tevpf::File& to,
              const std::string& name) {
  if (element.kind == tevpf::Kind::list) {
    transfer_list(from.list(element.name), to.create_list(name, element.description));
  } else {
    transfer_table(from.table(element.name), to.create_table(name, element.description));
  }
}

}  // namespace tool
