// One text through library and model; everything that both can be asked is compared.
#ifndef SUPPORT_EQUATION_COMPARE_H
#define SUPPORT_EQUATION_COMPARE_H

#include <string>

#include <Kq_BoolEquationImp.h>

#include "reference/equation.h"
#include "support/library_view.h"

namespace support {

// Tables of more variables than this are not tabulated.
const unsigned int kMaxTabulated = 12;

// State, tree, renderings, variables, handles; "" or what differs first.
std::string CompareState(const reference::Equation& model, const Kq_BoolEquationImp& library);

// Eval for every assignment, init values, truth table. Leaves every variable at 1.
std::string CompareResults(reference::Equation& model, Kq_BoolEquationImp& library);

// Sets 'text' on both and compares result, messages, state and results.
// Requires: 'capture' is the one that records now.
std::string CompareSet(const std::string& text, reference::Equation& model,
                       Kq_BoolEquationImp& library, Capture& capture);

// Compares and forgets the messages that both have issued since the last call.
std::string CompareAndForgetMessages(Capture& capture);

} // namespace support

#endif
