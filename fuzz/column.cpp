// The input is an expression over up to 17 variables, and pieces of its column. The whole column,
// the pieces, every kernel and evaluation, by nodes and compiled, must give what plain operations
// on columns of bits give while the expression is written.
#include <algorithm>
#include <array>

#include <Kq_BoolEquationImp.h>

#include "Column.h"
#include "fuzz/bytes.h"
#include "fuzz/target.h"
#include "support/library_view.h"

namespace fuzz {

namespace {

typedef std::vector<uint64_t> Column;

// Blocks with more rows than those of 14 variables are split.
const unsigned int kMaxVariables = 17;
// A kernel works on tiles of 64 words, the rows of 12 variables.
const unsigned int kMinKernelVariables = 12;
const size_t kMaxOperators = 200;
const size_t kMaxPieces = 8;
const size_t kNumEvaluatedRows = 24;

struct Operand {
    std::string text;
    Column column;
};

struct Piece {
    size_t first;
    size_t length;
};

struct Case {
    unsigned int numVariables;
    Operand expression;
    std::vector<Piece> pieces;
    size_t firstRow; // the first of those that are evaluated
};

size_t NumWords(unsigned int numVariables)
{
    return numVariables > 6 ? size_t(1) << (numVariables - 6) : 1;
}

// Bit k is the value of the variable in row k; the first variable is the highest bit of k. With
// fewer than six variables the rows repeat up to the end of the word.
Operand Variable(unsigned int variable, unsigned int numVariables)
{
    static const uint64_t kPatterns[6] = {0xaaaaaaaaaaaaaaaau, 0xccccccccccccccccu,
                                          0xf0f0f0f0f0f0f0f0u, 0xff00ff00ff00ff00u,
                                          0xffff0000ffff0000u, 0xffffffff00000000u};
    const unsigned int bit = numVariables - 1 - variable;
    Operand operand = {"x" + std::to_string(variable), Column(NumWords(numVariables), 0)};
    for (size_t word = 0; word < operand.column.size(); ++word) {
        if (bit < 6)
            operand.column[word] = kPatterns[bit];
        else if ((word >> (bit - 6) & 1u) != 0)
            operand.column[word] = ~uint64_t(0);
    }
    return operand;
}

uint64_t Combined(size_t operation, uint64_t left, uint64_t right)
{
    switch (operation) {
    case 0:
        return left & right;
    case 1:
        return left | right;
    case 2:
        return left ^ right;
    case 3:
        return ~(left & right);
    case 4:
        return ~(left | right);
    default:
        return ~(left ^ right);
    }
}

Operand ReadOperand(Bytes& bytes, unsigned int numVariables)
{
    const size_t choice = bytes.Next();
    if (choice < 0xf0) {
        // A few variables or all: columns that repeat and those that do not take different paths.
        const unsigned int usual = choice < 0xc0 || numVariables < 3 ? numVariables : 3;
        return Variable(static_cast<unsigned int>(choice) % usual, numVariables);
    }
    const bool isOne = choice % 2 != 0;
    return Operand{isOne ? "1" : "(0)", Column(NumWords(numVariables), isOne ? ~uint64_t(0) : 0)};
}

void Complement(Operand& operand)
{
    operand.text = "~(" + operand.text + ")";
    for (uint64_t& word : operand.column)
        word = ~word;
}

// Combines the last two operands into one.
void Combine(size_t operation, std::vector<Operand>& stack)
{
    static const char* const kSpellings[] = {"&", "|", "^", "~&", "~|", "~^"};
    const Operand right = stack.back();
    stack.pop_back();
    Operand& left = stack.back();
    left.text = "(" + left.text + " " + kSpellings[operation] + " " + right.text + ")";
    for (size_t word = 0; word < left.column.size(); ++word)
        left.column[word] = Combined(operation, left.column[word], right.column[word]);
}

// Postfix: bytes that put an operand on a stack, bytes that combine the top two, and bytes that do
// both. What is left at the end is combined too.
Operand ReadExpression(Bytes& bytes, unsigned int numVariables)
{
    std::vector<Operand> stack = {ReadOperand(bytes, numVariables)};
    for (size_t count = 0; count < kMaxOperators && !bytes.IsAtEnd(); ++count) {
        const size_t action = bytes.Next();
        const size_t kind = action % 8;
        if (kind == 7)
            Complement(stack.back());
        else if (kind < 6)
            stack.push_back(ReadOperand(bytes, numVariables));
        if ((kind < 4 || kind == 6) && stack.size() > 1)
            Combine(action / 8 % 6, stack);
    }
    while (stack.size() > 1)
        Combine(stack.size() % 6, stack);
    return stack[0];
}

Case Read(const std::string& input)
{
    Bytes bytes(input);
    Case given;
    given.numVariables = 1 + static_cast<unsigned int>(bytes.Below(kMaxVariables));
    const size_t numWords = NumWords(given.numVariables);
    given.firstRow = bytes.Next() * 257;
    for (size_t count = bytes.Below(kMaxPieces); count > 0; --count) {
        const size_t first = bytes.Next() * 256 % numWords + bytes.Next() % numWords;
        const size_t limit = numWords - first % numWords;
        given.pieces.push_back(Piece{first % numWords, 1 + bytes.Next() * 16 % limit});
    }
    given.expression = ReadExpression(bytes, given.numVariables);
    return given;
}

bool SetLibrary(const Case& given, Kq_BoolEquationImp& equation)
{
    std::vector<std::string> names;
    for (unsigned int variable = 0; variable < given.numVariables; ++variable)
        names.push_back("x" + std::to_string(variable));
    return equation.SetEquationWithExplicitTerms(
        support::ToPort(names), support::ToPort("(" + given.expression.text + ")"), false, false);
}

std::string CompareColumn(const Case& given, const Kq_BoolEquationImp& equation)
{
    KqColumn column(equation.GetRoot(), given.numVariables);
    Column words(column.GetNumWords(), 0x55);
    column.Fill(0, words.size(), words.data());
    if (words != given.expression.column)
        return "the whole column differs";
    for (const Piece& piece : given.pieces) {
        Column part(piece.length, 0xaa);
        column.Fill(piece.first, piece.length, part.data());
        if (!std::equal(part.begin(), part.end(),
                        words.begin() + static_cast<std::ptrdiff_t>(piece.first)))
            return "words from " + std::to_string(piece.first) + ", " +
                   std::to_string(piece.length) + " of them, differ";
    }
    return "";
}

std::string CompareKernels(const Case& given, const Kq_BoolEquationImp& equation)
{
    const KqProgram program = KqCompile(equation.GetRoot(), given.numVariables, true);
    if (program.numCodes == 0 || given.numVariables < kMinKernelVariables)
        return "";
    size_t numKernels = 0;
    const KqNamedKernel* kernels = KqGetKernels(&numKernels);
    Column stack(kKqMaxStack * kKqTileWords);
    for (size_t index = 0; index < numKernels; ++index) {
        if (!kernels[index].isSupported())
            continue;
        Column words(given.expression.column.size(), 0x55);
        kernels[index].run(program.codes.data(), program.numCodes, program.isInverted, words.size(),
                           stack.data(), words.data());
        if (words != given.expression.column)
            return std::string("kernel ") + kernels[index].name + " differs";
    }
    return "";
}

std::string CompareEvaluation(const Case& given, Kq_BoolEquationImp& equation)
{
    const size_t numRows = size_t(1) << given.numVariables;
    for (size_t count = 0; count < kNumEvaluatedRows; ++count) {
        const size_t row = (given.firstRow + count * 2731) % numRows;
        for (unsigned int variable = 0; variable < given.numVariables; ++variable)
            equation.SetVariable(equation.GetVariables()[variable].first,
                                 row >> (given.numVariables - 1 - variable) & 1u);
        const unsigned int expected = given.expression.column[row / 64] >> (row % 64) & 1u;
        if (equation.Eval() != expected)
            return "Eval differs in row " + std::to_string(row);
        if (equation.GetRoot()->Eval(equation.GetVariables()) != expected)
            return "evaluation of the nodes differs in row " + std::to_string(row);
    }
    return "";
}

} // namespace

std::string Describe(const std::string& input)
{
    const Case given = Read(input);
    std::string text =
        std::to_string(given.numVariables) + " variables, " + given.expression.text + "\n";
    for (const Piece& piece : given.pieces)
        text += "  words from " + std::to_string(piece.first) + ", " +
                std::to_string(piece.length) + " of them\n";
    return text;
}

std::string Check(const std::string& input)
{
    const Case given = Read(input);
    Kq_BoolEquationImp equation;
    if (!SetLibrary(given, equation))
        return "the expression is refused";
    std::string difference = CompareColumn(given, equation);
    if (difference.empty())
        difference = CompareKernels(given, equation);
    return difference.empty() ? CompareEvaluation(given, equation) : difference;
}

} // namespace fuzz
