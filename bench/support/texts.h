// Equation texts and init values of fixed shapes, made from fixed seeds.
#ifndef BENCH_TEXTS_H
#define BENCH_TEXTS_H

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include <Kq_BoolEquationImpNode.h>

namespace bench {

// Wide: x0 & x1 | x2 ..., with the operators in turn and the names repeating after 'numNames'.
std::string MakeWide(size_t numTokens, size_t numNames);
// Deep, with the groups in the right operand: ~(x0 & ~(x1 | ~(x2 ...
std::string MakeDeep(size_t numTokens, size_t numNames);
// Deep, with the groups in the left operand: ((((x0 & x1) | x2) ^ x3) ...
std::string MakeDeepLeft(size_t numTokens, size_t numNames);
// A random text of exactly 'numTokens' tokens with groups and negations, over at most 'numNames'
// names.
std::string MakeTypical(size_t numTokens, size_t numNames, unsigned int seed);

// The three shapes that every step is measured with.
struct Shape {
    std::string name;
    std::string (*make)(size_t numTokens, size_t numNames);
};
std::vector<Shape> GetShapes();

// x0, x1, ...
std::vector<Port::StringBase<char>> MakeNames(size_t numNames);

// "0x" and 2^numVariables/4 random digits, at least one.
std::string MakeInitValue(unsigned int numVariables, unsigned int seed);
// The column that a text "0x..." stands for.
std::vector<uint64_t> ReadInitValue(const std::string& text);
// The digits of a column over at least two variables, as "0x...".
std::string WriteInitValue(const std::vector<uint64_t>& words, unsigned int numVariables);

// Nodes of the tree, including groups and their ends: as many as the text has tokens.
size_t CountNodes(const Kq_BoolEquationImp::Node* root);

} // namespace bench

#endif
