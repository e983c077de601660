#include "commands.h"

namespace tool {
namespace {

constexpr Command kCommands[] = {
    {"info", "Say what FILE holds, one line an element", "FILE --json --names", run_info},
    {"show", "Show a list or a table, aligned, with units",
     "FILE ELEMENT --columns --sort --from --to --json --list --table", run_show},
    {"get", "Print the value of a parameter", "FILE LIST PARAM", run_get},
    {"add", "Add a parameter to a list; both are made when they are not there",
     "FILE LIST [PARAM] [VALUE] --type --units --min --max --precision --description --before "
     "--after --position --no-lock",
     run_add},
    {"define", "Define a column of a table, or change it; makes what is not there",
     "FILE TABLE [COLUMN] --type --width --units --min --max --precision --description --index "
     "--unique --default --before --after --position --no-lock",
     run_define},
    {"set", "Change a parameter's value or definition, or a description",
     "FILE ELEMENT [MEMBER] [VALUE] --type --width --units --min --max --precision --description "
     "--index --unique --before --after --position --list --table --no-lock",
     run_set},
    {"dump", "Write the text dump of FILE, or of one element",
     "FILE [ELEMENT] -o --list --table --force", run_dump},
    {"export", "Write a list or a table as CSV", "FILE ELEMENT -o --list --table", run_export},
    {"import", "Add the rows of a CSV file to a table, made when it is not there",
     "FILE TABLE CSV --no-lock", run_import},
    {"check", "Say whether FILE is in order, or what is wrong and where", "FILE", run_check},
    {"new", "Make an empty FILE", "FILE", run_new},
    {"rm", "Remove a list or a table, or a parameter or a column of it",
     "FILE ELEMENT [MEMBER] --list --table --no-lock", run_rm},
    {"cp", "Copy a list or a table within FILE", "FILE ELEMENT NEW --list --table --no-lock",
     run_cp},
    {"mv", "Rename a list or a table, or rename or move a parameter or a column of it",
     "FILE ELEMENT [MEMBER] [NEW] --before --after --position --list --table --no-lock", run_mv},
};

}  // namespace

std::span<const Command> commands() { return kCommands; }

}  // namespace tool
