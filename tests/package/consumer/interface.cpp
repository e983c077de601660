// Every template of the C++ interface once, to be compiled with all warnings.
#include <tevpf.hpp>

#include <algorithm>
#include <iostream>
#include <numeric>

namespace {

template <class T>
bool has(const tevpf::List& list, const char* name, const T& wanted) {
  return list.get<T>(name) == wanted && list.at(name).get<T>() == wanted;
}

bool lists_work(tevpf::File& file) {
  tevpf::List list = file.create_list("list");
  list.add(tevpf::Parameter("i", 1).bounds(0, 10u));
  list.add(tevpf::Parameter("s", std::int16_t{2}).bounds(std::int8_t{0}, 10L));
  list.add(tevpf::Parameter("f", 0.5f).bounds(0, 1.0));
  list.add(tevpf::Parameter("d", 0.25).bounds(-1.5f, 1));
  list.add(tevpf::Parameter("t", "text"));
  list.set("i", std::size_t{3});
  list.set(std::string("f"), 1);
  list.set(std::string_view("t"), std::string("other"));
  list.set("d", list.at("d").value());
  int count = 0;
  for (const tevpf::Parameter& parameter : list) count += parameter.name().size() == 1;
  return has(list, "i", 3) && has(list, "s", std::int16_t{2}) && has(list, "f", 1.0f) &&
         has(list, "d", 0.25) && has(list, "t", std::string("other")) && count == 5 &&
         list.find("x") == std::nullopt && list.at(0).name() == "i";
}

bool tables_work(tevpf::File& file) {
  tevpf::Table table = file.create_table("table");
  table.add_column(tevpf::Column("i", tevpf::Type::int32).unique());
  table.add_column(tevpf::Column("s", tevpf::Type::int16));
  table.add_column(tevpf::Column("f", tevpf::Type::float32));
  table.add_column(tevpf::Column("d", tevpf::Type::float64));
  table.add_column(tevpf::Column("t", tevpf::Type::string).width(4));
  for (int i = 9; i >= 0; --i) table.append({i, 2, 0.5, 0.25 * i, "four"});
  double sum = 0;
  for (auto [i, s, f, d, view, text] :
       table.ordered_by("i")
           .from(5)
           .fields<std::int32_t, std::int16_t, float, double, std::string_view, std::string>(
               "i", "s", "f", "d", "t", "t")) {
    sum += i + s + static_cast<double>(f) + d + static_cast<double>(view.size() + text.size());
  }
  for (auto row : table) sum += row.get<double>("d") + row.get<std::int32_t>(0);
  std::vector<double> values(table.size());
  table.column("d", std::span(values));
  const auto texts = table.column<std::string>("t");
  tevpf::Row row(*std::ranges::begin(table));
  table.replace(row.set("t", "one").set(3, -1));
  return sum == 96.25 + 56.25 && std::accumulate(values.begin(), values.end(), 0.0) == 11.25 &&
         texts.at(9) == "four" && table.column<float>("f").size() == 10 &&
         table.find("t", "one")->get<double>("d") == -1 && table.row(0).value("i").index() == 0;
}

}  // namespace

int main() try {
  auto file = tevpf::File::create("interface.pf");
  const bool works = lists_work(file) && tables_work(file);
  if (!works) std::cerr << "interface.cpp: a value is wrong\n";
  return works ? 0 : 1;
} catch (const std::exception& error) {
  std::cerr << error.what() << '\n';
  return 1;
}
