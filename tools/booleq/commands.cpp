// The table of commands.
#include "commands.h"

#include <algorithm>

namespace booleq {

const std::vector<Option>& CommonOptions()
{
    static const std::vector<Option> options = {
        {"--inputs", "A,B,C", "The inputs, most significant first; 'a,b' in quotes is one name"},
        {"--lsb-first", nullptr, "Init value: its first input is bit 0 of the row number"},
        {"--reverse", nullptr, "Init value: take --inputs from the last to the first"},
        {"--file", "FILE", "Take each line of FILE for the equation; - is standard input"},
        {"--json", nullptr, "Answer with one JSON object on a line for each equation"},
        {"--debug", nullptr, "Let the library's diagnostics go to standard error"},
    };
    return options;
}

const std::vector<Command>& Commands()
{
    static const std::vector<Command> commands = {
        ShowCommand(),    CheckCommand(), EvalCommand(),    TableCommand(),
        InitCommand(),    EqualCommand(), SatCommand(),     ExplainCommand(),
        PermuteCommand(), MatchCommand(), ConvertCommand(), LintCommand(),
        TreeCommand(),    KmapCommand(),  BatchCommand(),   MinimizeCommand(),
    };
    return commands;
}

const Command* FindCommand(const std::string& word)
{
    const std::vector<Command>& commands = Commands();
    const auto found =
        std::find_if(commands.begin(), commands.end(),
                     [&word](const Command& command) { return word == command.name; });
    return found == commands.end() ? nullptr : &*found;
}

} // namespace booleq
