// Help, man page and bash completion, all made from the table of commands.
#ifndef BOOLEQ_HELP_H
#define BOOLEQ_HELP_H

#include <string>
#include <vector>

#include "command.h"

namespace booleq {

// The answer to a command line without a command: --help, --version, --man-page, --completion.
// False for any other.
bool AnswerForTool(const std::vector<std::string>& arguments, std::string& answer);

std::string ToolHelp();
std::string CommandHelp(const Command& command);
// The commands of a group.  Requires: a group of this name.
std::string GroupHelp(const std::string& word);
std::string ManPage(); // roff, for section 1
std::string BashCompletion();

} // namespace booleq

#endif
