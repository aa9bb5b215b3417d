// Verilog, converted to JSON by the program yosys.
// Fails: ReadFault if the program is missing, refuses the text, or takes too long. However the work
// ends, even by a signal that kills this process, the program is killed and no file is left.
#ifndef BOOLEQ_DESIGN_YOSYS_PROCESS_H
#define BOOLEQ_DESIGN_YOSYS_PROCESS_H

#include "source_text.h"

namespace booleq {

// Releases the Verilog text once it is written for the program; 'json' gets what the program
// writes. Both go through nameless files, so no user's file name appears in a command.
void ConvertVerilog(SourceText& verilog, double seconds, SourceText& json);

} // namespace booleq

#endif
