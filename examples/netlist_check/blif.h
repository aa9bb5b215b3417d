// Reads a netlist of look-up tables in the Berkeley Logic Interchange Format, as Yosys and
// berkeley-abc write it: one model of .names blocks.
#ifndef NETLIST_CHECK_BLIF_H
#define NETLIST_CHECK_BLIF_H

#include "network.h"

// Each block becomes a table whose equation is read from the block's init value.
// Fails: Fault with file, line, what is wrong and what to do about it.
Network ReadBlif(const std::string& path);

#endif
