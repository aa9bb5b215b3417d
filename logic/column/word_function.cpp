#include "word_function.h"

#include <utility>

#include "watch.h"

namespace booleq {

Function Tabulate(const WordFunction& function, const std::vector<std::string>& inputs)
{
    const auto numInputs = static_cast<unsigned int>(inputs.size());
    Rows rows(numInputs);
    std::vector<uint64_t> values(numInputs);
    for (size_t word = 0; word < rows.Size(); ++word) {
        if (word % kWatchedWords == 0)
            Watch();
        for (unsigned int input = 0; input < numInputs; ++input)
            values[input] = InputWord(numInputs, input, word);
        rows.Words()[word] = function(values) & RowMask(numInputs);
    }
    return Function(inputs, std::move(rows));
}

} // namespace booleq
