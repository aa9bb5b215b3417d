// The commands, each in the file of its name; commands.cpp puts them into the table.
#ifndef BOOLEQ_COMMANDS_H
#define BOOLEQ_COMMANDS_H

#include "command.h"

namespace booleq {

Command ShowCommand();
Command CheckCommand();
Command EvalCommand();
Command TableCommand();
Command InitCommand();
Command EqualCommand();
Command SatCommand();
Command TreeCommand();
Command KmapCommand();
Command ExplainCommand();
Command PermuteCommand();
Command MatchCommand();
Command BatchCommand();
Command ConvertCommand();
Command LintCommand();
Command MinimizeCommand();
Command NetlistStatsCommand();
Command NetlistListCommand();
Command NetlistCheckCommand();
Command NetlistDiffCommand();

} // namespace booleq

#endif
