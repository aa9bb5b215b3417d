// Verilog by way of the program yosys, which reads it and writes JSON.
// Throws ReadFault: the program is not there, refuses the text, or takes too long. Whatever ends
// the work, also a signal that ends this process, the program is ended and no file is left.
#ifndef BOOLEQ_DESIGN_YOSYS_PROCESS_H
#define BOOLEQ_DESIGN_YOSYS_PROCESS_H

#include "source_text.h"

namespace booleq {

// The Verilog text is given up when it is in the program's hands; 'json' is what the program
// writes. Both are files without a name, so no name of a file of the user's is in a command.
void ConvertVerilog(SourceText& verilog, double seconds, SourceText& json);

} // namespace booleq

#endif
