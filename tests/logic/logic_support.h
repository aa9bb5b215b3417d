// Helpers that the tests of logic/ share.
#ifndef LOGIC_SUPPORT_H
#define LOGIC_SUPPORT_H

#include <random>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "expression.h"
#include "function.h"
#include "listed_inputs.h"

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

// The function as which the library reads an init value.
inline booleq::Function FromInit(const std::string& text, const std::vector<std::string>& inputs)
{
    booleq::Reading reading;
    reading.hasInputs = true;
    reading.inputs = inputs;
    Kq_BoolEquation equation;
    booleq::Function function;
    EXPECT_TRUE(SetFromText(equation, text, reading) && FunctionOf(equation, function)) << text;
    return function;
}

// Half of the rows are ones, or, for 'isSparse', a quarter.
inline booleq::Function RandomFunction(const std::vector<std::string>& inputs,
                                       std::mt19937_64& random, bool isSparse = false)
{
    booleq::Rows rows(static_cast<unsigned int>(inputs.size()));
    for (size_t word = 0; word < rows.Size(); ++word)
        rows.Words()[word] =
            (isSparse ? random() & random() : random()) & booleq::RowMask(rows.NumInputs());
    return {inputs, rows};
}

// One more pigeon than holes, each in a hole and no two in the same: never 1, and hard for every
// search that resolves clauses (Haken, "The intractability of resolution", 1985).
inline std::string Pigeons(int numHoles)
{
    const auto sits = [](int pigeon, int hole) {
        return "p" + std::to_string(pigeon) + "_" + std::to_string(hole);
    };
    std::string text;
    for (int pigeon = 0; pigeon <= numHoles; ++pigeon) {
        text += pigeon == 0 ? "(" : " & (";
        for (int hole = 0; hole < numHoles; ++hole)
            text += (hole == 0 ? "" : " | ") + sits(pigeon, hole);
        text += ")";
    }
    for (int hole = 0; hole < numHoles; ++hole)
        for (int pigeon = 0; pigeon <= numHoles; ++pigeon)
            for (int other = 0; other < pigeon; ++other)
                text += " & (" + sits(pigeon, hole) + " ~& " + sits(other, hole) + ")";
    return text;
}

} // namespace logic_support

#endif
