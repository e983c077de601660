#include "arguments.h"

#include <CLI/CLI.hpp>
#include <cstdio>
#include <sstream>
#include <variant>

#include "output.h"
#include "text.h"

namespace tool {
namespace {

using Member = std::variant<std::string Arguments::*, std::vector<std::string> Arguments::*,
                            std::size_t Arguments::*, bool Arguments::*>;

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
    {"PARAM", nullptr, nullptr, "The name of a parameter", &Arguments::parameter},
    {"VALUE", nullptr, nullptr, "The new value; put -- before one like -x", &Arguments::value},
    {"NEW", nullptr, nullptr, "The new name, at most 19 characters", &Arguments::new_name},
    {"CSV", nullptr, nullptr, "The CSV file, - for standard input", &Arguments::csv},
    {"SQL", nullptr, nullptr, "The statements; without them, those on standard input",
     &Arguments::statements},
    {"-o", "-o,--output", "OUT", "Write to OUT instead of standard output", &Arguments::output},
    {"--columns", "--columns", "A,B,...", "Show these columns, in this order", &Arguments::columns},
    {"--sort", "--sort", "COLUMN", "Show rows in the order of this column", &Arguments::sort},
    {"--from", "--from", "ROW", "First row to show, counted from 1", &Arguments::from},
    {"--to", "--to", "ROW", "Last row to show", &Arguments::to},
    {"--with", "--with", "OTHER", "Another file, in SQL by its name without ending",
     &Arguments::with},
    {"--csv", "--csv", nullptr, "Write CSV", &Arguments::as_csv},
    {"--json", "--json", nullptr, "Write JSON", &Arguments::json},
    {"--names", "--names", nullptr, "Print the names of the elements alone", &Arguments::names},
    {"--list", "--list", nullptr, "The name is that of a list", &Arguments::list},
    {"--table", "--table", nullptr, "The name is that of a table", &Arguments::table},
    {"--force", "--force", nullptr, "Write a dump that is far longer than FILE", &Arguments::force},
};

std::string counted_from_one(const std::string& text) {
  return text == "0" ? "rows are counted from 1" : "";
}

void declare(CLI::App& app, const Argument& argument, bool required, Arguments& into) {
  std::visit(
      [&](auto member) {
        auto& target = into.*member;
        if constexpr (std::is_same_v<decltype(target), bool&>) {
          app.add_flag(argument.option, target, argument.help);
        } else if (argument.option == nullptr) {
          app.add_option(argument.name, target, argument.help)
              ->option_text(" ")
              ->required(required);
        } else {
          CLI::Option* option = app.add_option(argument.option, target, argument.help);
          option->option_text(argument.value);
          option->allow_extra_args(false);  // one value each time it is given
          if constexpr (std::is_same_v<decltype(target), std::size_t&>) {
            option->check(counted_from_one);
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

}  // namespace

bool read_arguments(const Command& command, int argc, const char* const* argv, Arguments& arguments,
                    ExitStatus& status) {
  CLI::App app(command.help, std::string("tevpf ") + command.name);
  app.allow_windows_style_options(false);
  declare_all(app, command.arguments, arguments);
  if (CLI::Option* list = app.get_option_no_throw("--list")) list->excludes("--table");
  if (CLI::Option* csv = app.get_option_no_throw("--csv")) csv->excludes("--json");
  try {
    app.parse(argc, argv);
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
