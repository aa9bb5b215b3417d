// One text through library and model: compares everything that both can answer.
#ifndef SUPPORT_EQUATION_COMPARE_H
#define SUPPORT_EQUATION_COMPARE_H

#include <string>

#include <Kq_BoolEquationImp.h>

#include "reference/equation.h"
#include "support/library_view.h"

namespace support {

// Equations of more variables are not tabulated.
const unsigned int kMaxTabulated = 12;

// Compares state, tree, renderings, variables, handles; "" or the first difference.
std::string CompareState(const reference::Equation& model, const Kq_BoolEquationImp& library);

// Compares Eval for every assignment, init values, truth table. Leaves every variable at 1.
std::string CompareResults(reference::Equation& model, Kq_BoolEquationImp& library);

// Sets 'text' on both and compares result, messages, state and results.
// Requires: 'capture' is the one that is recording.
std::string CompareSet(const std::string& text, reference::Equation& model,
                       Kq_BoolEquationImp& library, Capture& capture);

// Compares, then forgets, the messages that both have issued since the last call.
std::string CompareAndForgetMessages(Capture& capture);

} // namespace support

#endif
