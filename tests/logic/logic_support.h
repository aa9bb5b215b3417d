// What the tests of logic/ share.
#ifndef LOGIC_SUPPORT_H
#define LOGIC_SUPPORT_H

#include <random>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "expression.h"
#include "function.h"

namespace logic_support {

inline booleq::Expression Parsed(const std::string& text)
{
    Kq_BoolEquation equation;
    EXPECT_TRUE(equation.SetEquation(text.c_str())) << text;
    return booleq::ToExpression(equation);
}

// "v0", "v1", ...
inline std::vector<std::string> Names(size_t numInputs)
{
    std::vector<std::string> names;
    for (size_t input = 0; input < numInputs; ++input)
        names.push_back("v" + std::to_string(input));
    return names;
}

// Half of the rows are ones, or, for 'isSparse', a quarter.
inline booleq::Function RandomFunction(const std::vector<std::string>& inputs,
                                       std::mt19937_64& random, bool isSparse = false)
{
    std::vector<uint64_t> words(inputs.size() > 6 ? size_t(1) << (inputs.size() - 6) : 1);
    for (uint64_t& word : words)
        word = isSparse ? random() & random() : random();
    if (inputs.size() < 6)
        words[0] &= (uint64_t(1) << (1u << inputs.size())) - 1;
    return {inputs, words};
}

} // namespace logic_support

#endif
