// A fuzz target: what an input stands for, and whether the library handles it as it should.
// Each target is one source with these two functions; a fuzzer or a replay calls them.
#ifndef FUZZ_TARGET_H
#define FUZZ_TARGET_H

#include <string>

namespace fuzz {

// Describes the input in words that a test can be written from, each line ended. Does not run it,
// so that inputs that crash or hang can be described too.
std::string Describe(const std::string& input);

// "" or the first thing that is wrong, with a reduced input where the target can reduce it.
std::string Check(const std::string& input);

} // namespace fuzz

#endif
