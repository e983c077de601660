#include "commands.h"

namespace tool {
namespace {

constexpr Command kCommands[] = {
    {"info", "Say what FILE holds, one line an element", "FILE --json --names", run_info},
    {"show", "Show a list or a table, aligned, with units",
     "FILE ELEMENT --columns --sort --from --to --json --list --table", run_show},
    {"get", "Print the value of a parameter", "FILE LIST PARAM", run_get},
    {"set", "Change the value of a parameter, within its bounds", "FILE LIST PARAM VALUE", run_set},
    {"dump", "Write the text dump of FILE, or of one element",
     "FILE [ELEMENT] -o --list --table --force", run_dump},
    {"export", "Write a list or a table as CSV", "FILE ELEMENT -o --list --table", run_export},
    {"import", "Add the rows of a CSV file to a table, made when it is not there", "FILE TABLE CSV",
     run_import},
    {"sql", "Run SQL statements over FILE", "FILE [SQL] --with --csv --json", run_sql},
    {"check", "Say whether FILE is in order, or what is wrong and where", "FILE", run_check},
    {"new", "Make an empty FILE", "FILE", run_new},
    {"rm", "Remove a list or a table", "FILE ELEMENT --list --table", run_rm},
    {"cp", "Copy a list or a table within FILE", "FILE ELEMENT NEW --list --table", run_cp},
    {"mv", "Rename a list or a table", "FILE ELEMENT NEW --list --table", run_mv},
};

}  // namespace

std::span<const Command> commands() { return kCommands; }

}  // namespace tool
