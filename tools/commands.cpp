#include "commands.h"

namespace tool {
namespace {

constexpr Command kCommands[] = {
    {"info", "Say what FILE holds, or how a list or a table is defined",
     "FILE [ELEMENT] --json --names --list --table", run_info},
    {"show", "Show a list or a table, aligned, with units",
     "FILE ELEMENT --columns --where --sort --from --to --limit --count --summary --json --wide "
     "--list --table",
     run_show},
    {"get", "Print the value of a parameter", "FILE LIST PARAM --json", run_get},
    {"diff", "Say how two files differ", "FILE OTHER --json", run_diff},
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
    {"insert", "Add a row to a table", "FILE TABLE CELLS --position --no-lock", run_insert},
    {"update", "Change what rows of a table hold",
     "FILE TABLE CHANGES --where --from --to --all --no-lock", run_update},
    {"delete", "Delete rows of a table", "FILE TABLE --where --from --to --all --no-lock",
     run_delete},
    {"rm", "Remove a list or a table, or a parameter or a column of it",
     "FILE ELEMENT [MEMBER] --list --table --no-lock", run_rm},
    {"mv", "Rename a list or a table, or rename or move a parameter or a column of it",
     "FILE ELEMENT [MEMBER] [NEW] --before --after --position --list --table --no-lock", run_mv},
    {"cp", "Copy a list or a table, within FILE or into another file",
     "FILE ELEMENT [NEW] --to-file --on-conflict --list --table --no-lock", run_cp},
    {"merge", "Add the lists and tables of another file to FILE",
     "FILE OTHER --on-conflict --no-lock", run_merge},
    {"export", "Write a list or a table as CSV, or everything as JSON",
     "FILE [ELEMENT] -o --json --columns --delimiter --no-header --missing --crlf --list --table",
     run_export},
    {"import", "Add a CSV file to a table or a list, or what a JSON file holds to FILE",
     "FILE [ELEMENT] [CSV] csv:--columns csv:--types csv:--width csv:--default --delimiter "
     "csv:--no-header --shorten-names csv:--missing --fill --decimal-comma --skip --comment "
     "csv:--force csv:--list csv:--table --on-conflict --no-lock",
     run_import},
    {"dump", "Write the text dump of FILE, or of one element",
     "FILE [ELEMENT] -o --list --table --force", run_dump},
    {"report", "Write FILE as a page of HTML, with figures", "FILE -o --rows", run_report},
    {"sql", "Run SQL statements over FILE", "FILE [SQL] --with --csv --json --no-lock", run_sql},
    {"check", "Say whether FILE is in order, or what is wrong and where", "FILE", run_check},
    {"new", "Make an empty FILE", "FILE", run_new},
};

}  // namespace

std::span<const Command> commands() { return kCommands; }

}  // namespace tool
