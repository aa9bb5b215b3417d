// Tables of cubes from everything else that says which rows are on and which are free: equations,
// columns with free rows, truth tables as comma-separated values. And back: a sum as expressions.
#ifndef BOOLEQ_MINIMISE_CUBE_TABLE_H
#define BOOLEQ_MINIMISE_CUBE_TABLE_H

#include <string>
#include <vector>

#include "expression.h"
#include "pla.h"

namespace booleq {

struct TableOutput {
    std::string name;
    Expression on;
    bool hasFree = false;
    Expression free; // rows where it is 1 may be either
};

// The table over 'inputs', which include all names of the expressions.
// Fails: false with the fault, for an operand of too many cubes.
// Cost: for up to 16 inputs as many steps as there are rows; for more it works with the cubes of
// the operands, of which an exclusive OR of n inputs has 2^(n-1). Recursion: none.
bool TableOf(const std::vector<TableOutput>& outputs, const std::vector<std::string>& inputs,
             Pla& table, PlaFault& fault, Work& work);
// The names of all expressions in order of first occurrence.
std::vector<std::string> InputsOf(const std::vector<TableOutput>& outputs);

// True for "0b" and digits 0, 1 and x with at least one x.
bool IsInitWithFree(const std::string& text);
// One output from such a text, read like an init value over 'inputs' with one digit for each row.
// Fails: false, with the reason.  Requires: IsInitWithFree(text).
bool TableFromInit(const std::string& text, const std::vector<std::string>& inputs, bool lsbFirst,
                   const std::string& output, Pla& table, std::string& reason);

// A truth table: names in the first line, then a line for each row with 0, 1, - (or x) in each
// column. The last 'numOutputs' columns are outputs. Rows that are not listed are free.
// Fails: false, with the fault.
bool ReadCsv(const std::string& text, size_t numOutputs, Pla& table, PlaFault& fault);

// The sum of one output as an expression. If 'isInverted', the terms are those of the inverted
// function and the result is a product of sums.
Expression ExpressionOf(const Pla& table, const CubeList& sum, size_t output, bool isInverted);

} // namespace booleq

#endif
