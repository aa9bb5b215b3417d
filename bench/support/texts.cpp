// Texts of fixed shapes.
#include "texts.h"

#include <random>

namespace bench {

namespace {

const char* const kOperators[] = {" & ", " | ", " ^ ", " ~& ", " ~| ", " ~^ "};

std::string MakeName(size_t index)
{
    return "x" + std::to_string(index);
}

// A number below 'limit'. Written by hand, because the distributions of standard libraries may
// differ, and the texts must not.
size_t Draw(std::mt19937& random, size_t limit)
{
    return random() % limit;
}

// May fall one short of 'numTokens': one token is too few for an operator and an operand.
std::string DrawTypical(size_t numTokens, size_t numNames, std::mt19937& random, size_t* numDrawn)
{
    std::string text;
    size_t numUsed = 0;
    size_t numOpen = 0;
    for (;;) {
        for (; numUsed + numOpen + 4 < numTokens && Draw(random, 3) == 0; ++numUsed) {
            const bool isGroup = Draw(random, 2) == 0;
            text += isGroup ? "(" : "~";
            numOpen += isGroup ? 1 : 0;
        }
        text += MakeName(Draw(random, numNames));
        ++numUsed;
        for (; numOpen > 0 && Draw(random, 5) < 2; --numOpen, ++numUsed)
            text += ")";
        if (numUsed + numOpen + 2 > numTokens)
            break;
        text += kOperators[Draw(random, 6)];
        ++numUsed;
    }
    *numDrawn = numUsed + numOpen;
    return text.append(numOpen, ')');
}

std::string MakeTypicalOnce(size_t numTokens, size_t numNames)
{
    return MakeTypical(numTokens, numNames, 1);
}

} // namespace

std::string MakeWide(size_t numTokens, size_t numNames)
{
    std::string text = MakeName(0);
    for (size_t operand = 1; 2 * operand + 1 <= numTokens; ++operand)
        text += kOperators[operand % 6] + MakeName(operand % numNames);
    return text;
}

std::string MakeDeep(size_t numTokens, size_t numNames)
{
    std::string text;
    size_t numLevels = 0;
    for (; 5 * numLevels + 1 < numTokens; ++numLevels)
        text += "~(" + MakeName(numLevels % numNames) + kOperators[numLevels % 6];
    return text + MakeName(0) + std::string(numLevels, ')');
}

std::string MakeDeepLeft(size_t numTokens, size_t numNames)
{
    const size_t numLevels = numTokens / 4;
    std::string text(numLevels, '(');
    text += MakeName(0);
    for (size_t level = 0; level < numLevels; ++level)
        text += kOperators[level % 6] + MakeName((level + 1) % numNames) + ")";
    return text;
}

std::string MakeTypical(size_t numTokens, size_t numNames, unsigned int seed)
{
    std::mt19937 random(seed);
    for (;;) {
        size_t numDrawn = 0;
        const std::string text = DrawTypical(numTokens, numNames, random, &numDrawn);
        if (numDrawn == numTokens)
            return text;
    }
}

std::vector<Shape> GetShapes()
{
    return {{"typical", MakeTypicalOnce}, {"wide", MakeWide}, {"deep", MakeDeep}};
}

std::vector<Port::StringBase<char>> MakeNames(size_t numNames)
{
    std::vector<Port::StringBase<char>> names;
    for (size_t index = 0; index < numNames; ++index)
        names.push_back(MakeName(index).c_str());
    return names;
}

std::string MakeInitValue(unsigned int numVariables, unsigned int seed)
{
    std::mt19937 random(seed);
    const size_t numDigits = numVariables > 2 ? size_t(1) << (numVariables - 2) : 1;
    std::string text = "0x";
    for (size_t digit = 0; digit < numDigits; ++digit)
        text += "0123456789abcdef"[Draw(random, 16)];
    return text;
}

std::vector<uint64_t> ReadInitValue(const std::string& text)
{
    const size_t numDigits = text.length() - 2;
    std::vector<uint64_t> words((numDigits + 15) / 16);
    for (size_t digit = 0; digit < numDigits; ++digit) {
        const char character = text[text.length() - 1 - digit];
        const int value = character >= 'a' ? character - 'a' + 10 : character - '0';
        words[digit / 16] |= uint64_t(value) << (digit % 16 * 4);
    }
    return words;
}

std::string WriteInitValue(const std::vector<uint64_t>& words, unsigned int numVariables)
{
    const size_t numDigits = size_t(1) << (numVariables - 2);
    std::string text(2 + numDigits, '0');
    text[1] = 'x';
    for (size_t digit = 0; digit < numDigits; ++digit)
        text[text.length() - 1 - digit] =
            "0123456789abcdef"[words[digit / 16] >> (digit % 16 * 4) & 15u];
    return text;
}

size_t CountNodes(const Kq_BoolEquationImp::Node* root)
{
    size_t numNodes = 0;
    std::vector<const Kq_BoolEquationImp::Node*> pending;
    if (root)
        pending.push_back(root);
    while (!pending.empty()) {
        const Kq_BoolEquationImp::Node* node = pending.back();
        pending.pop_back();
        ++numNodes;
        if (node->GetLeftChild())
            pending.push_back(node->GetLeftChild());
        if (node->GetRightChild())
            pending.push_back(node->GetRightChild());
    }
    return numNodes;
}

} // namespace bench
