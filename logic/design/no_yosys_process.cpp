// Replaces yosys_process.cpp on systems that do not start programs as POSIX does.
#include "yosys_process.h"

#include "read_fault.h"

namespace booleq {

void ConvertVerilog(SourceText&, double, SourceText&)
{
    throw ReadFault{
        "Verilog cannot be read on this system; write the netlist as JSON, BLIF or EDIF"};
}

} // namespace booleq
