// A target under libFuzzer: any fault ends the process, with the input described in words.
#include <cstdint>
#include <cstdio>
#include <cstdlib>

#include "fuzz/target.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    const std::string input(data, data + size);
    const std::string difference = fuzz::Check(input);
    if (!difference.empty()) {
        std::fprintf(stderr, "%s%s\n", fuzz::Describe(input).c_str(), difference.c_str());
        std::abort();
    }
    return 0;
}
