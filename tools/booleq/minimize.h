// What the files of the command 'minimize' share.
#ifndef BOOLEQ_MINIMIZE_H
#define BOOLEQ_MINIMIZE_H

#include <string>

#include "answer.h"
#include "cube_table.h"
#include "sum.h"

namespace booleq {

// What to minimise, from the words or the file of the command line.
struct MinimizeInput {
    Pla table;
    bool isPla = false; // it was read from a PLA file
    Text text;          // for refusals and JSON: the equation, or the file's name
};

// Fails: false, and the refusal has been printed; UsageError; IoError.
bool ReadMinimizeInput(const Request& request, Output& output, Work& work, MinimizeInput& input);

// Refuses a file for a fault in one of its lines.
void RefuseFault(const MinimizeInput& input, const Request& request, Output& output,
                 const PlaFault& fault);

// The Karnaugh map of each output with a letter for each term, or a picture of one output with its
// terms as frames. 'isColoured': each term has its own colour in the text.
// Requires: one to six inputs; one output for the picture.
void PutMapOfTerms(const Pla& table, const Sum& sum, bool isColoured, Output& output);
void PutPictureOfTerms(const Pla& table, const Sum& sum, Output& output);

} // namespace booleq

#endif
