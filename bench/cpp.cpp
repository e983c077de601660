// The C++ interface beside the C calls that a program would make in its place.
#include <tevpf.hpp>

#include <cstring>

#include "common.h"

namespace {

using namespace bench;

std::string name_of(std::int64_t i) {
  char name[TEVPF_NAME_SIZE];
  std::snprintf(name, sizeof name, "param_%08x", static_cast<unsigned>(i) * 2654435761u);
  return name;
}

// A file with a list of doubles, and a table of rows of 48 bytes.
class Data {
 public:
  Data(std::int64_t list, std::int64_t rows) : file_(tevpf::File::create(path())) {
    auto params = file_.create_list("list");
    for (std::int64_t i = 0; i < list; ++i) names_.push_back(name_of(i));
    std::vector<std::string> sorted = names_;
    std::sort(sorted.begin(), sorted.end());
    for (const std::string& name : sorted) params.add(tevpf::Parameter(name, 0.125).units("mm"));

    using tevpf::Type;
    auto table = file_.create_table("parts");
    for (const auto& [name, type] : {std::pair("id", Type::int32),
                                     {"name", Type::string},
                                     {"measure", Type::float64},
                                     {"class", Type::int16},
                                     {"group", Type::int32}}) {
      table.add_column(tevpf::Column(name, type).width(20));
    }
    tevpf::Row row = table.new_row();
    for (std::int64_t i = 0; i < rows; ++i) {
      row.set("id", i).set("measure", static_cast<double>(i) * 0.37).set("name", "a part");
      table.append(row.set("group", (i * 7919) % 1'000'003));
    }
    table.redefine("group", table.definition("group").indexed());
  }

  const std::vector<std::string>& names() const { return names_; }
  tevpf::List list() const { return file_.list("list"); }
  tevpf::Table table() const { return file_.table("parts"); }

 private:
  static std::string path() { return folder().file("cpp.pf"); }
  tevpf::File file_;
  std::vector<std::string> names_;
};

template <class Body>
void run(benchmark::State& state, Body body) {
  for (auto _ : state) {
    const Timer timer;
    const double sum = body();
    timer.stop(state, state.range(0));
    benchmark::DoNotOptimize(sum);
  }
}

// ---- Rows ----

double sum_rows(const tevpf::RowRange& rows) {
  double sum = 0;
  for (const auto& [id, measure] : rows.fields<std::int32_t, double>("id", "measure"))
    sum += id + measure;
  return sum;
}

double sum_rows_in_c(const char* order) {
  static std::int32_t* offsets;
  std::int32_t columns, rows, row_size, width, current;
  MUST(TEV8R1_PF_inq_col_offsets("parts", &columns, &offsets));
  MUST(TEV8R1_PF_inq_table_info("parts", &columns, &rows, &row_size, &width, &current));
  MUST(TEV8R1_PF_define_table_search("parts", order));
  MUST(TEV8R1_PF_reset_table("parts"));
  std::vector<char> row(static_cast<std::size_t>(row_size));
  double sum = 0;
  while (TEV8R1_PF_get_next_row("parts", row.data()) == PF_NORMAL) {
    std::int32_t id;
    double measure;
    std::memcpy(&id, row.data() + offsets[0], sizeof id);
    std::memcpy(&measure, row.data() + offsets[2], sizeof measure);
    sum += id + measure;
  }
  std::free(offsets);
  return sum;
}

void rows_cpp(benchmark::State& state) {
  const Data data(0, state.range(0));
  run(state, [&] { return sum_rows(data.table().rows()); });
}
void rows_c(benchmark::State& state) {
  const Data data(0, state.range(0));
  run(state, [] { return sum_rows_in_c(nullptr); });
}
void ordered_cpp(benchmark::State& state) {
  const Data data(0, state.range(0));
  run(state, [&] { return sum_rows(data.table().ordered_by("group")); });
}
void ordered_c(benchmark::State& state) {
  const Data data(0, state.range(0));
  run(state, [] { return sum_rows_in_c("group"); });
}

// ---- Columns ----

void column_cpp(benchmark::State& state) {
  const Data data(0, state.range(0));
  const tevpf::Table table = data.table();
  run(state, [&] { return table.column<double>("measure").back(); });
}
void column_span_cpp(benchmark::State& state) {
  const Data data(0, state.range(0));
  const tevpf::Table table = data.table();
  std::vector<double> values(static_cast<std::size_t>(state.range(0)));
  run(state, [&] { return values[table.column("measure", std::span(values)) - 1]; });
}
void column_span_c(benchmark::State& state) {
  const Data data(0, state.range(0));
  std::vector<double> values(static_cast<std::size_t>(state.range(0)));
  run(state, [&] {
    MUST(TEV8R1_PF_get_col_values("parts", "measure", values.data()));
    return values.back();
  });
}
void column_c(benchmark::State& state) {
  const Data data(0, state.range(0));
  run(state, [] {
    std::int32_t rows;
    MUST(TEV8R1_PF_inq_num_rows("parts", &rows));
    auto* values =
        static_cast<double*>(std::malloc(static_cast<std::size_t>(rows) * sizeof(double)));
    MUST(TEV8R1_PF_get_col_values("parts", "measure", values));
    const double last = values[rows - 1];
    std::free(values);
    return last;
  });
}

// ---- Parameters ----

void parameter_cpp(benchmark::State& state) {
  const Data data(state.range(0), 0);
  const std::vector<std::int32_t> order = shuffled(state.range(0));
  const tevpf::List list = data.list();
  run(state, [&] {
    double sum = 0;
    for (const std::int32_t i : order) sum += list.get<double>(data.names()[i]);
    return sum;
  });
}
void parameter_c(benchmark::State& state) {
  const Data data(state.range(0), 0);
  const std::vector<std::int32_t> order = shuffled(state.range(0));
  run(state, [&] {
    double sum = 0;
    for (const std::int32_t i : order) {
      double value;
      MUST(TEV8R1_PF_get_param_value("list", data.names()[i].c_str(), &value));
      sum += value;
    }
    return sum;
  });
}
// Without knowing beforehand that the parameter is a double.
void parameter_c_checked(benchmark::State& state) {
  const Data data(state.range(0), 0);
  const std::vector<std::int32_t> order = shuffled(state.range(0));
  run(state, [&] {
    double sum = 0;
    for (const std::int32_t i : order) {
      const char* const name = data.names()[i].c_str();
      std::int32_t type;
      double value;
      MUST(TEV8R1_get_param_type("list", name, &type));
      if (type != PF_TYPE_DOUBLE) give_up(name, type);
      MUST(TEV8R1_PF_get_param_value("list", name, &value));
      sum += value;
    }
    return sum;
  });
}

const int registered = [] {
  add("C++ rows", "tevpf", rows_cpp, kManyPasses);
  add("C++ rows", "limit: C calls", rows_c, kManyPasses);
  add("C++ rows in index order", "tevpf", ordered_cpp, kFewPasses);
  add("C++ rows in index order", "limit: C calls", ordered_c, kFewPasses);
  add("C++ column", "tevpf", column_cpp, kManyPasses);
  add("C++ column", "limit: C calls", column_c, kManyPasses);
  add("C++ column into a span", "tevpf", column_span_cpp, kManyPasses);
  add("C++ column into a span", "limit: C calls", column_span_c, kManyPasses);
  add("C++ parameter by name", "tevpf", parameter_cpp, kFewPasses);
  add("C++ parameter by name", "limit: C calls", parameter_c, kFewPasses);
  add("C++ parameter by name", "limit: C calls, type looked up", parameter_c_checked, kFewPasses);
  return 0;
}();

}  // namespace
