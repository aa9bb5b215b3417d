// What the 'netlist ...' commands share: their options, and reading a file as the request says.
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

// Stands for the equation of a function that has no short one.
constexpr char kNoExpression[] = "(no expression short enough)";

// --cells and --top.
std::vector<Option> NetlistOptions();

// The known cell types, with those of --cells.
// Fails: UsageError for a file that cannot be read or is not such a table.
CellTypes CellTypesOf(const Request& request);

// Fails: IoError, for a file operand that cannot be opened.
void CheckFiles(const Request& request);

// Reads a netlist; on a terminal, shows how far it has got.
// Fails: false, and the refusal has been printed or answered: return kRefused. IoError, when the
// file cannot be opened.
bool ReadNetlist(const std::string& file, const Request& request, const CellTypes& cellTypes,
                 const std::string& keyAttribute, Output& output, Design& design);
// Reads two of them, at the same time where there are two processors.
bool ReadNetlists(const Request& request, const CellTypes& cellTypes,
                  const std::string& keyAttribute, Output& output, Design& left, Design& right);

} // namespace booleq

#endif
