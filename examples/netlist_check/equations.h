// Reads a file of equations: what a netlist should compute.
#ifndef NETLIST_CHECK_EQUATIONS_H
#define NETLIST_CHECK_EQUATIONS_H

#include "network.h"

// Lines "name = equation". An equation uses inputs of the netlist, 'inputs', and names that earlier
// lines define. Empty lines and lines that begin with '#' are skipped.
// Fails: Fault with file, line, column, what is wrong and what to do about it.
Network ReadEquations(const std::string& path, const std::vector<std::string>& inputs);

#endif
