#include "arguments.h"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <limits>
#include <optional>
#include <sstream>
#include <type_traits>
#include <utility>
#include <variant>
#include <vector>

#include "output.h"
#include "text.h"

namespace tool {
namespace {

template <class T>
using Place = T Arguments::*;
using Member = std::variant<Place<std::string>, Place<std::vector<std::string>>, Place<std::size_t>,
                            Place<bool>, Place<std::optional<std::string>>,
                            Place<std::optional<std::int32_t>>, Place<std::optional<bool>>>;

struct Argument {
  const char* name;    // as commands declare it
  const char* option;  // as CLI11 names it; null: a positional argument of that name
  const char* value;   // what stands behind an option, null for flags
  const char* help;
  Member member;
};

const Argument kArguments[] = {
    {"FILE", nullptr, nullptr, "The parameter file", &Arguments::file},
    {"ELEMENT", nullptr, nullptr, "The name of a list or a table", &Arguments::element},
    {"LIST", nullptr, nullptr, "The name of a list", &Arguments::element},
    {"TABLE", nullptr, nullptr, "The name of a table", &Arguments::element},
    {"PARAM", nullptr, nullptr, "The name of a parameter", &Arguments::member},
    {"COLUMN", nullptr, nullptr, "The name of a column", &Arguments::member},
    {"MEMBER", nullptr, nullptr, "The name of a parameter or a column", &Arguments::member},
    {"VALUE", nullptr, nullptr, "The value; put -- before one like -x", &Arguments::value},
    {"NEW", nullptr, nullptr, "The new name, at most 19 characters", &Arguments::new_name},
    {"CSV", nullptr, nullptr, "The CSV or JSON file, - for standard input", &Arguments::csv},
    {"SQL", nullptr, nullptr, "The statements; without them, those on standard input",
     &Arguments::statements},
    {"-o", "-o,--output", "OUT", "Write to OUT instead of standard output", &Arguments::output},
    {"--columns", "--columns", "A,B,...", "Show these columns, in this order", &Arguments::columns},
    {"--sort", "--sort", "A,-B,...", "Show rows in the order of these columns, -B downwards",
     &Arguments::sort},
    {"--where", "--where", "CONDITION", "Only rows for which this SQL expression is true",
     &Arguments::where},
    {"--limit", "--limit", "N", "At most so many rows", &Arguments::limit},
    {"--count", "--count", nullptr, "Print the number of rows alone", &Arguments::count},
    {"--summary", "--summary", nullptr, "Of each column: count, missing, smallest, largest, mean",
     &Arguments::summary},
    {"--wide", "--wide", nullptr, "Do not cut columns to fit a terminal", &Arguments::wide},
    {"--all", "--all", nullptr, "All rows", &Arguments::all},
    {"OTHER", nullptr, nullptr, "The other parameter file", &Arguments::other},
    {"CELLS", nullptr, nullptr, "Values by their columns: COLUMN=VALUE ...", &Arguments::cells},
    {"CHANGES", nullptr, nullptr, "SQL assignments: \"COLUMN = EXPRESSION, ...\"",
     &Arguments::changes},
    {"--to-file", "--to", "OTHER", "Copy into this file, which is made when it is not there",
     &Arguments::to_file},
    {"--on-conflict", "--on-conflict", "WHAT",
     "When a name is taken: refuse (the default), rename, replace or skip",
     &Arguments::on_conflict},
    {"--from", "--from", "ROW", "First row, counted from 1", &Arguments::from},
    {"--to", "--to", "ROW", "Last row", &Arguments::to},
    {"--rows", "--rows", "COUNT", "Rows to show of each list or table, 1000 if not given",
     &Arguments::rows},
    {"--with", "--with", "OTHER", "Another file, in SQL by its name without ending",
     &Arguments::with},
    {"--csv", "--csv", nullptr, "Write CSV", &Arguments::as_csv},
    {"--json", "--json", nullptr, "Write JSON", &Arguments::json},
    {"--names", "--names", nullptr, "Print the names of the elements alone", &Arguments::names},
    {"--type", "--type", "TYPE", "integer, short, real, double or string", &Arguments::type},
    {"--width", "--width", "BYTES", "Longest text of a string column; of others, for reports",
     &Arguments::width},
    {"--units", "--units", "TEXT", "Units, at most 7 bytes", &Arguments::units},
    {"--min", "--min", "NUMBER", "Smallest value, or none", &Arguments::min},
    {"--max", "--max", "NUMBER", "Largest value, or none", &Arguments::max},
    {"--precision", "--precision", "DIGITS", "Significant digits of a real or double",
     &Arguments::precision},
    {"--description", "--description", "TEXT", "Description", &Arguments::description},
    {"--index", "--index,!--no-index", nullptr, "The column has an index, or none",
     &Arguments::index},
    {"--unique", "--unique,!--no-unique", nullptr, "No two rows hold the same value, or they may",
     &Arguments::unique},
    {"--default", "--default", "VALUE", "What rows that are there hold in a new column",
     &Arguments::default_value},
    {"--before", "--before", "NAME", "Put it in front of this one", &Arguments::before},
    {"--after", "--after", "NAME", "Put it behind this one", &Arguments::after},
    {"--position", "--position", "N", "Put it at this place, counted from 1", &Arguments::position},
    {"--no-lock", "--no-lock", nullptr, "Change FILE without a lock", &Arguments::no_lock},
    {"--list", "--list", nullptr, "The name is that of a list", &Arguments::list},
    {"--table", "--table", nullptr, "The name is that of a table", &Arguments::table},
    {"--force", "--force", nullptr, "Write a dump that is far longer than FILE", &Arguments::force},
    {"--delimiter", "--delimiter", "CHAR",
     "What stands between fields: a character, comma, semicolon, tab", &Arguments::delimiter},
    {"--no-header", "--no-header", nullptr, "Write no header row", &Arguments::no_header},
    {"--missing", "--missing", "TEXT", "What stands for a number that is none (nan)",
     &Arguments::missing},
    {"--crlf", "--crlf", nullptr, "End lines with CR and LF", &Arguments::crlf},
    {"csv:--columns", "--columns", "A,B,...",
     "Import these columns alone; with --no-header, the names of all", &Arguments::columns},
    {"csv:--types", "--types", "COLUMN=TYPE,...",
     "Types in a new table: integer, short, real, double, string", &Arguments::types},
    {"csv:--width", "--width", "COLUMN=N,...",
     "Width of a string column in a new table; longer texts are cut", &Arguments::widths},
    {"csv:--default", "--default", "COLUMN=VALUE", "The value where the CSV has none",
     &Arguments::defaults},
    {"csv:--no-header", "--no-header", nullptr, "The first line is a row already",
     &Arguments::no_header},
    {"--shorten-names", "--shorten-names", nullptr,
     "Cut long names of columns, number equal ones, name empty ones", &Arguments::shorten_names},
    {"csv:--missing", "--missing", "TEXT",
     "A field that says TEXT is empty; may be given several times", &Arguments::missing},
    {"--fill", "--fill", nullptr, "Take fields that a short row lacks as empty", &Arguments::fill},
    {"--decimal-comma", "--decimal-comma", nullptr, "Numbers have a comma before their decimals",
     &Arguments::decimal_comma},
    {"--skip", "--skip", "N", "Leave out the first N lines", &Arguments::skip},
    {"--comment", "--comment", "TEXT", "Leave out lines that start with TEXT", &Arguments::comment},
    {"csv:--force", "--force", nullptr, "Make a table that is far larger than the CSV",
     &Arguments::force},
    {"csv:--list", "--list", nullptr, "Make or extend a list", &Arguments::list},
    {"csv:--table", "--table", nullptr, "Make or extend a table", &Arguments::table},
};

std::string counted_from_one(const std::string& text) {
  return text == "0" ? "it is counted from 1" : "";
}

void declare(CLI::App& app, const Argument& argument, bool required, Arguments& into) {
  std::visit(
      [&](auto member) {
        auto& target = into.*member;
        using T = std::remove_cvref_t<decltype(target)>;
        if constexpr (std::is_same_v<T, bool>) {
          app.add_flag(argument.option, target, argument.help);
        } else if constexpr (std::is_same_v<T, std::optional<bool>>) {
          // Given as the form with "!" in the table, it counts below 0.
          app.add_flag_function(
              argument.option, [&target](std::int64_t count) { target = count > 0; },
              argument.help);
        } else if (argument.option == nullptr) {
          app.add_option(argument.name, target, argument.help)
              ->option_text(" ")
              ->required(required);
        } else {
          CLI::Option* option = app.add_option(argument.option, target, argument.help);
          option->option_text(argument.value);
          option->allow_extra_args(false);  // one value each time it is given
          if constexpr (std::is_same_v<T, std::size_t>) {
            const std::string word = argument.value;
            if (word == "ROW" || word == "N") option->check(counted_from_one);
          }
          if constexpr (std::is_same_v<T, std::optional<std::int32_t>>) {
            option->check(CLI::Range(1, std::numeric_limits<std::int32_t>::max()));
          }
        }
      },
      argument.member);
}

void declare_all(CLI::App& app, const char* names, Arguments& into) {
  std::istringstream words(names);
  for (std::string word; words >> word;) {
    const bool optional = word.front() == '[';
    if (optional) word = word.substr(1, word.size() - 2);
    for (const Argument& argument : kArguments) {
      if (word == argument.name) declare(app, argument, !optional, into);
    }
  }
}

void exclude_each_other(CLI::App& app, const std::vector<const char*>& names) {
  for (const char* name : names) {
    for (const char* other : names) {
      CLI::Option* option = app.get_option_no_throw(name);
      if (option != nullptr && name != other && app.get_option_no_throw(other) != nullptr) {
        option->excludes(other);
      }
    }
  }
}

// The words of a command line, the last one first, as CLI11 wants them. Of "--units=" it would take
// the next word for the value, so such an option and its empty value become two words.
std::vector<std::string> reversed(std::vector<std::string> line) {
  std::vector<std::string> words;
  bool may_be_option = true;
  for (std::string& word : line) {
    may_be_option = may_be_option && word != "--";
    const bool is_empty = may_be_option && word.starts_with("--") && word.ends_with('=') &&
                          std::count(word.begin(), word.end(), '=') == 1;
    if (is_empty) word.pop_back();
    words.push_back(std::move(word));
    if (is_empty) words.emplace_back();
  }
  std::reverse(words.begin(), words.end());
  return words;
}

}  // namespace

bool read_arguments(const Command& command, std::vector<std::string> words, Arguments& arguments,
                    ExitStatus& status) {
  CLI::App app(command.help, std::string("tevpf ") + command.name);
  app.allow_windows_style_options(false);
  declare_all(app, command.arguments, arguments);
  exclude_each_other(app, {"--list", "--table"});
  exclude_each_other(app, {"--csv", "--json"});
  exclude_each_other(app, {"--before", "--after", "--position"});
  try {
    app.parse(reversed(std::move(words)));
    return true;
  } catch (const CLI::CallForHelp&) {
    print(app.help());
    status = kDone;
  } catch (const CLI::ParseError& error) {
    std::fprintf(stderr, "tevpf %s: %s; 'tevpf %s --help' shows how to call it\n", command.name,
                 visible(error.what()).c_str(), command.name);
    status = kUsage;
  }
  return false;
}

}  // namespace tool
