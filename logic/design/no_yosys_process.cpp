// In place of yosys_process.cpp, for systems that start programs in another way than POSIX.
#include "yosys_process.h"

#include "read_fault.h"

namespace booleq {

void ConvertVerilog(SourceText&, double, SourceText&)
{
    throw ReadFault{
        "Verilog cannot be read on this system; write the netlist as JSON, BLIF or EDIF"};
}

} // namespace booleq
