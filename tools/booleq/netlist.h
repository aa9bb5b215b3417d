// What the commands 'netlist ...' share: their options, and reading a file as the request says.
#ifndef BOOLEQ_NETLIST_H
#define BOOLEQ_NETLIST_H

#include <string>
#include <vector>

#include "answer.h"
#include "cell_types.h"
#include "command.h"
#include "design.h"
#include "output.h"

namespace booleq {

// What stands for the equation of a function that has no short one.
constexpr char kNoExpression[] = "(no expression short enough)";

// --cells and --top.
std::vector<Option> NetlistOptions();

// The cell types that are known, with those of --cells.
// Fails: UsageError for a file that cannot be read or is not such a table.
CellTypes CellTypesOf(const Request& request);

// Fails: IoError, for an operand that is a file and cannot be opened.
void CheckFiles(const Request& request);

// Reads a netlist; shows how far it is, on a terminal.
// Fails: false, and the refusal has been said or answered: return kRefused. IoError, when the file
// cannot be opened.
bool ReadNetlist(const std::string& file, const Request& request, const CellTypes& cellTypes,
                 const std::string& keyAttribute, Output& output, Design& design);
// Two of them, at once where there are two processors.
bool ReadNetlists(const Request& request, const CellTypes& cellTypes,
                  const std::string& keyAttribute, Output& output, Design& left, Design& right);

} // namespace booleq

#endif
