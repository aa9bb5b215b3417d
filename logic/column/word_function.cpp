#include "word_function.h"

#include <utility>

#include "watch.h"

namespace booleq {

uint64_t InputWord(unsigned int numInputs, unsigned int input, uint64_t word)
{
    static constexpr uint64_t kPatterns[] = {0xaaaaaaaaaaaaaaaa, 0xcccccccccccccccc,
                                             0xf0f0f0f0f0f0f0f0, 0xff00ff00ff00ff00,
                                             0xffff0000ffff0000, 0xffffffff00000000};
    const unsigned int bit = numInputs - 1 - input; // of the row number
    if (bit < 6)
        return kPatterns[bit];
    return (word >> (bit - 6)) & 1u ? ~0ull : 0;
}

Function Tabulate(const WordFunction& function, const std::vector<std::string>& inputs)
{
    const auto numInputs = static_cast<unsigned int>(inputs.size());
    std::vector<uint64_t> words(numInputs > 6 ? size_t(1) << (numInputs - 6) : 1);
    std::vector<uint64_t> values(numInputs);
    for (size_t word = 0; word < words.size(); ++word) {
        if (word % kWatchedWords == 0)
            Watch();
        for (unsigned int input = 0; input < numInputs; ++input)
            values[input] = InputWord(numInputs, input, word);
        words[word] = function(values);
    }
    if (numInputs < 6)
        words[0] &= (uint64_t(1) << (1u << numInputs)) - 1;
    return Function(inputs, std::move(words));
}

} // namespace booleq
