// Scripts on engine or facade against the model: every result, every message, and what the objects
// show.
#ifndef RANDOM_SCRIPT_RUN_H
#define RANDOM_SCRIPT_RUN_H

#include "random/script.h"

namespace script {

enum class Side { Engine, Facade };

// The first difference between library and model, or "". Looks at objects after the last step and,
// with 'looksOften', after each step.
// Requires: Tokenize and Build steps only on the engine.
std::string Run(Side side, const std::vector<Step>& steps, bool looksOften);

// Removes steps, many at once first, as long as the script still differs.
std::vector<Step> Shrink(Side side, std::vector<Step> steps, bool looksOften);

} // namespace script

#endif
