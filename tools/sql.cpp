// tevpf sql: statements over FILE and other files, their results as aligned text, CSV or JSON.
#include <deque>
#include <filesystem>
#include <map>
#include <optional>

#include "commands.h"
#include "csv_writer.h"
#include "files.h"
#include "input.h"
#include "json.h"
#include "output.h"
#include "platform.h"
#include "sql/database.h"
#include "text.h"
#include "text_table.h"
#include "values.h"

namespace tool {
namespace {

using sql::Statement;
using SqlType = Statement::Type;

bool is_number(SqlType type) { return type == SqlType::integer || type == SqlType::real; }

// Numbers of single precision by their shortest text, like everywhere in the tool.
Value real_value(const Statement& row, int column) {
  if (row.is_single(column)) return static_cast<float>(row.real(column));
  return row.real(column);
}

std::string field_text(const Statement& row, int column) {
  return row.type(column) == SqlType::real ? exact_text(real_value(row, column)) : row.text(column);
}

std::string field_json(const Statement& row, int column) {
  switch (row.type(column)) {
    case SqlType::null:
      return "null";
    case SqlType::integer:
      return std::to_string(row.integer(column));
    case SqlType::real:
      return value_json(real_value(row, column));
    default:
      return text_json(row.text(column));
  }
}

// ---- The results of one statement ---------------------------------------------------------------

void write_text(Output& output, Statement& rows) {
  const auto columns = static_cast<std::size_t>(rows.columns());
  std::vector<std::string> cells;
  std::vector<bool> are_numbers(columns, true);
  while (rows.step()) {
    for (std::size_t c = 0; c < columns; ++c) {
      const int column = static_cast<int>(c);
      const SqlType type = rows.type(column);
      cells.push_back(field_text(rows, column));
      if (type != SqlType::null && !is_number(type)) are_numbers[c] = false;
    }
  }
  TextTable text;
  for (std::size_t c = 0; c < columns; ++c) {
    text.add_column(rows.name(static_cast<int>(c)),
                    are_numbers[c] ? TextTable::Align::kRight : TextTable::Align::kLeft);
  }
  text.write(output, cells.size() / columns,
             [&](std::size_t row, std::size_t c) { return cells[row * columns + c]; });
}

void write_csv(Output& output, Statement& rows) {
  CsvWriter writer(output, {});
  for (int c = 0; c < rows.columns(); ++c) writer.text(rows.name(c));
  writer.end_record();
  while (rows.step()) {
    for (int c = 0; c < rows.columns(); ++c) writer.text(field_text(rows, c));
    writer.end_record();
  }
  writer.finish();
}

void write_json(Output& output, Statement& rows) {
  output.write("[");
  const char* separator = "\n";
  while (rows.step()) {
    std::string line = separator;
    for (int c = 0; c < rows.columns(); ++c) {
      line += (c == 0 ? "{" : ",") + text_json(rows.name(c)) + ":" + field_json(rows, c);
    }
    output.write(line += "}");
    separator = ",\n";
  }
  output.write("\n]\n");
}

// ---- Statements ---------------------------------------------------------------------------------

// Results go out one below the other. When their reader has gone, statements still run to the end.
class Results {
 public:
  Results(const Arguments& arguments, const std::string& file)
      : arguments_(arguments), output_({}, file) {}

  void write(Statement& rows) {
    if (is_closed_) return;
    try {
      const bool is_text = !arguments_.json && !arguments_.as_csv;
      if (is_text && count_++ > 0) output_.write("\n");
      arguments_.json     ? write_json(output_, rows)
      : arguments_.as_csv ? write_csv(output_, rows)
                          : write_text(output_, rows);
    } catch (const ClosedPipe&) {
      is_closed_ = true;
    }
  }
  void finish() {
    try {
      if (!is_closed_) output_.finish();
    } catch (const ClosedPipe&) {
      is_closed_ = true;
    }
  }

 private:
  const Arguments& arguments_;
  Output output_;
  bool is_closed_ = false;
  int count_ = 0;
};

void run_all(sql::Database& database, std::string_view statements, Results& results) {
  for (int number = 1; !statements.empty(); ++number) {
    try {
      Statement statement = database.prepare(statements);
      statement.columns() > 0 ? results.write(statement) : static_cast<void>(statement.step());
    } catch (const sql::Error& error) {
      if (number == 1) throw;
      throw sql::Error("statement " + std::to_string(number) + ": " + error.what());
    }
  }
  if (database.is_in_transaction()) throw sql::Error("BEGIN without COMMIT");
}

// FILE and those of --with, open under the names of their schemas.
class Sources {
 public:
  explicit Sources(const Arguments& arguments) {
    if (!arguments.no_lock) lock(arguments);
    add(arguments.file, "main");
    for (const std::string& path : arguments.with) {
      add(path, name_of(path_of(path).stem()));
    }
  }

  void save_changed() {
    for (Source& source : sources_) {
      if (database_.is_changed(source.schema)) save(source.file);
    }
  }
  // How it ends when one of them is damaged.
  ExitStatus finish() const {
    ExitStatus status = kDone;
    for (const Source& source : sources_) {
      if (finish_reading(source.file) != kDone) status = kUnreadable;
    }
    return status;
  }
  sql::Database& database() { return database_; }

 private:
  struct Source {
    tevpf::File file;
    std::string schema;
  };

  // In one order for all programs, so that no two of them wait for each other.
  void lock(const Arguments& arguments) {
    std::map<std::filesystem::path, std::string> names;  // by what they stand for
    const auto add = [&](const std::string& name) {
      std::error_code ignored;
      names.emplace(std::filesystem::weakly_canonical(path_of(name), ignored), name);
    };
    add(arguments.file);
    for (const std::string& name : arguments.with) add(name);
    for (const auto& [whole, name] : names) take_lock(name, locks_.emplace_back());
  }

  void add(const std::string& path, const std::string& schema) {
    for (const Source& other : sources_) {
      refuse_same_file(other.file.name(), path);
      if (other.schema == schema) {
        throw Failure(kRefused, visible(path) + ": two files have the name " + in_quotes(schema) +
                                    " in SQL; rename or link one of them");
      }
    }
    sources_.push_back({open_to_read(path), schema});
    database_.attach(sources_.back().file, schema);
  }

  std::deque<std::optional<FileLock>> locks_;
  std::deque<Source> sources_;  // they stay where they are
  sql::Database database_;      // closed before its files
};

}  // namespace

ExitStatus run_sql(const Arguments& arguments) {
  Sources sources(arguments);
  const std::string statements =
      arguments.statements.empty()
          ? read_whole("-", "give statements behind FILE, or on standard input")
          : arguments.statements;
  Results results(arguments, arguments.file);
  try {
    run_all(sources.database(), statements, results);
  } catch (const sql::Error& error) {
    throw Failure(kRefused,
                  visible(arguments.file) + ": " + visible(error.what()) + "; nothing was changed");
  }
  results.finish();
  sources.save_changed();
  return sources.finish();
}

}  // namespace tool
