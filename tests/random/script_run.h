// Scripts on engine or facade against the model: every result, every message, and what can be seen
// of the objects.
#ifndef RANDOM_SCRIPT_RUN_H
#define RANDOM_SCRIPT_RUN_H

#include "random/script.h"

namespace script {

enum class Side { Engine, Facade };

// The first difference between library and model, or "". Objects are looked at after the last step
// and, with 'looksOften', after each one.
// Requires: steps of Tokenize and Build on the engine only.
std::string Run(Side side, const std::vector<Step>& steps, bool looksOften);

// Leaves out steps, many at once first, while the script still differs.
std::vector<Step> Shrink(Side side, std::vector<Step> steps, bool looksOften);

} // namespace script

#endif
