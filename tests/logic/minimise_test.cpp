// Sums of products: small tables against a search through all sums, larger ones by rows. The tests
// read the value of a row from the table's cubes, digit by digit.
#include <algorithm>
#include <random>

#include <gtest/gtest.h>

#include "blocking.h"
#include "cofactors.h"
#include "covering.h"
#include "cube_table.h"
#include "logic_support.h"
#include "proof.h"
#include "sum.h"
#include "unate.h"

namespace {

using namespace booleq;
using namespace logic_support;

// What a row of an output must be: '0', '1' or '-'.
typedef std::vector<std::string> Rows; // one text for each output, row 0 first

Pla FromRows(const Rows& rows, size_t numInputs)
{
    std::string text =
        ".i " + std::to_string(numInputs) + "\n.o " + std::to_string(rows.size()) + "\n";
    for (size_t row = 0; row < rows[0].size(); ++row) {
        for (size_t input = 0; input < numInputs; ++input)
            text += (row >> (numInputs - 1 - input) & 1) != 0 ? '1' : '0';
        text += ' ';
        for (const std::string& output : rows)
            text += output[row];
        text += '\n';
    }
    Pla table;
    PlaFault fault;
    EXPECT_TRUE(ReadPla(text, table, fault)) << fault.message;
    return table;
}

bool HasRow(const CubeSpace& space, const uint64_t* cube, size_t row)
{
    for (size_t input = 0; input < space.NumInputs(); ++input)
        if (!GetBit(cube, 2 * input + (row >> (space.NumInputs() - 1 - input) & 1)))
            return false;
    return true;
}

// The first row where the sum contradicts the rows; SIZE_MAX if there is none.
size_t FirstMistake(const CubeSpace& space, const Rows& rows, const CubeList& sum, bool isInverted)
{
    for (size_t output = 0; output < rows.size(); ++output)
        for (size_t row = 0; row < rows[output].size(); ++row) {
            bool value = isInverted;
            for (size_t term = 0; term < sum.Size(); ++term)
                if (GetBit(sum.At(term), space.OutputBit(output)) &&
                    HasRow(space, sum.At(term), row))
                    value = !isInverted;
            if (rows[output][row] != '-' && value != (rows[output][row] == '1'))
                return row;
        }
    return SIZE_MAX;
}

Rows RandomRows(size_t numInputs, size_t numOutputs, std::mt19937_64& random)
{
    const char* const digits[] = {"01", "01-", "001", "011-", "01--"};
    const std::string choice = digits[random() % 5];
    Rows rows(numOutputs, std::string(size_t(1) << numInputs, '0'));
    for (std::string& output : rows)
        for (char& digit : output)
            digit = choice[static_cast<size_t>(random() % choice.size())];
    return rows;
}

// Finds the cheapest cover by trying all of them: no cube calculus, no bound except the best so
// far.
class PlainSearch {
  public:
    PlainSearch(const Rows& rows, size_t numInputs, uint64_t termCost, uint64_t literalCost)
    {
        const size_t numRows = rows[0].size();
        size_t numCubes = 1;
        for (size_t input = 0; input < numInputs; ++input)
            numCubes *= 3;
        for (size_t cube = 0; cube < numCubes; ++cube)
            AddCube(rows, numInputs, cube, termCost, literalCost);
        for (size_t output = 0; output < rows.size(); ++output)
            for (size_t row = 0; row < numRows; ++row)
                if (rows[output][row] == '1')
                    m_needed |= uint64_t(1) << (output * numRows + row);
    }

    uint64_t Find()
    {
        DropReplaced();
        Cover(m_needed, 0);
        return m_best;
    }

  private:
    void AddCube(const Rows& rows, size_t numInputs, size_t cube, uint64_t termCost,
                 uint64_t literalCost)
    {
        uint64_t covered = 0;
        uint64_t cost = termCost;
        for (size_t input = 0, rest = cube; input < numInputs; ++input, rest /= 3)
            cost += rest % 3 != 2 ? literalCost : 0;
        for (size_t output = 0; output < rows.size(); ++output) {
            uint64_t here = 0;
            bool isRight = true;
            for (size_t row = 0; row < rows[0].size(); ++row) {
                bool isIn = true;
                for (size_t input = 0, rest = cube; input < numInputs; ++input, rest /= 3)
                    isIn = isIn && (rest % 3 == 2 || (row >> input & 1) == rest % 3);
                isRight = isRight && (!isIn || rows[output][row] != '0');
                if (isIn && rows[output][row] == '1')
                    here |= uint64_t(1) << (output * rows[0].size() + row);
            }
            covered |= isRight ? here : 0;
        }
        if (covered != 0)
            m_cubes.push_back({covered, cost});
    }

    // Drops products if another one covers as much at no more cost.
    void DropReplaced()
    {
        std::vector<std::pair<uint64_t, uint64_t>> useful;
        for (size_t index = 0; index < m_cubes.size(); ++index) {
            bool isReplaced = false;
            for (size_t other = 0; other < m_cubes.size() && !isReplaced; ++other) {
                const bool isEqual = m_cubes[other] == m_cubes[index];
                isReplaced =
                    other != index && (m_cubes[index].first & ~m_cubes[other].first) == 0 &&
                    m_cubes[other].second <= m_cubes[index].second && (!isEqual || other < index);
            }
            if (!isReplaced)
                useful.push_back(m_cubes[index]);
        }
        m_cubes.swap(useful);
    }

    void Cover(uint64_t needed, uint64_t cost)
    {
        if (cost >= m_best)
            return;
        if (needed == 0) {
            m_best = cost;
            return;
        }
        const uint64_t row = needed & (~needed + 1);
        for (const auto& cube : m_cubes)
            if ((cube.first & row) != 0)
                Cover(needed & ~cube.first, cost + cube.second);
    }

    std::vector<std::pair<uint64_t, uint64_t>> m_cubes; // what each covers, what it costs
    uint64_t m_needed = 0;
    uint64_t m_best = UINT64_MAX;
};

Sum Minimised(const Pla& table, const SumOptions& options)
{
    Sum sum(table.space);
    PlaFault fault;
    Work work;
    EXPECT_TRUE(Minimise(table, options, sum, fault, work)) << fault.message;
    return sum;
}

TEST(Minimise, ExactHasTheFewestTermsThenLiteralsOfAllSums)
{
    std::mt19937_64 random(17);
    for (int round = 0; round < 400; ++round) {
        const size_t numInputs = 1 + random() % 4;
        const size_t numOutputs = numInputs == 4 ? 1 : 1 + random() % 2;
        const Rows rows = RandomRows(numInputs, numOutputs, random);
        SumOptions options;
        options.isExact = true;
        options.goal = round % 2 == 0 ? Goal::Terms : Goal::Literals;
        const Sum sum = Minimised(FromRows(rows, numInputs), options);
        const uint64_t cost = round % 2 == 0 ? 1000 * sum.cost.numTerms + sum.cost.numLiterals
                                             : 1000 * sum.cost.numLiterals + sum.cost.numTerms;
        const uint64_t fewest = round % 2 == 0 ? PlainSearch(rows, numInputs, 1000, 1).Find()
                                               : PlainSearch(rows, numInputs, 1, 1000).Find();
        EXPECT_EQ(cost, fewest) << "round " << round;
        EXPECT_TRUE(sum.isProved && sum.isSecondProved) << "round " << round;
        EXPECT_EQ(FirstMistake(FromRows(rows, numInputs).space, rows, sum.cubes, false), SIZE_MAX);
    }
}

// Checks an exact search for the fewest terms, then literals, for one output, against the plain
// search.
void ExpectFewest(const Rows& rows, size_t numInputs)
{
    SumOptions options;
    options.isExact = true;
    const Pla table = FromRows(rows, numInputs);
    const Sum sum = Minimised(table, options);
    EXPECT_EQ(1000 * sum.cost.numTerms + sum.cost.numLiterals,
              PlainSearch(rows, numInputs, 1000, 1).Find())
        << rows[0];
    EXPECT_TRUE(sum.isProved && sum.isSecondProved) << rows[0];
    EXPECT_EQ(FirstMistake(table.space, rows, sum.cubes, false), SIZE_MAX) << rows[0];
}

TEST(Minimise, ExactHasTheFewestOfEveryFunctionOfThreeInputsWithFreeRows)
{
    for (size_t function = 0; function < 6561; ++function) {
        std::string digits;
        for (size_t rest = function; digits.size() < 8; rest /= 3)
            digits += "01-"[rest % 3];
        ExpectFewest({digits}, 3);
    }
}

// The function with its inputs in another order and some of them inverted.
uint32_t Renamed(uint32_t function, const std::vector<size_t>& order, size_t inverted)
{
    uint32_t renamed = 0;
    for (size_t row = 0; row < 16; ++row) {
        size_t source = 0;
        for (size_t input = 0; input < 4; ++input)
            source |= (row >> order[input] & 1) << input;
        renamed |= (function >> (source ^ inverted) & 1) << row;
    }
    return renamed;
}

// Renaming or inverting inputs does not change the cost, so one function of each class is enough.
TEST(Minimise, ExactHasTheFewestOfEveryFunctionOfFourInputs)
{
    std::vector<uint8_t> isKnown(65536, 0);
    size_t numClasses = 0;
    for (uint32_t function = 0; function < 65536; ++function) {
        if (isKnown[function] != 0)
            continue;
        ++numClasses;
        std::vector<size_t> order = {0, 1, 2, 3};
        do
            for (size_t inverted = 0; inverted < 16; ++inverted)
                isKnown[Renamed(function, order, inverted)] = 1;
        while (std::next_permutation(order.begin(), order.end()));
        std::string digits;
        for (size_t row = 0; row < 16; ++row)
            digits += (function >> row & 1) != 0 ? '1' : '0';
        ExpectFewest({digits}, 4);
    }
    EXPECT_EQ(numClasses, 402u);
}

TEST(Minimise, ExactHasTheFewestTermsOfFiveInputs)
{
    std::mt19937_64 random(5);
    for (int round = 0; round < 60; ++round)
        ExpectFewest(RandomRows(5, 1, random), 5);
}

TEST(Minimise, SumsAndProductsAreRightInEveryRow)
{
    std::mt19937_64 random(99);
    for (int round = 0; round < 60; ++round) {
        const size_t numInputs = 2 + static_cast<size_t>(random() % 7);
        const Rows rows = RandomRows(numInputs, 1 + random() % 4, random);
        const Pla table = FromRows(rows, numInputs);
        SumOptions options;
        options.isInverted = round % 2 == 1;
        const Sum sum = Minimised(table, options);
        EXPECT_EQ(FirstMistake(table.space, rows, sum.cubes, options.isInverted), SIZE_MAX);
        EXPECT_LE(sum.lowerBound, sum.cost.numTerms);
        Work work;
        CubeList broken = sum.cubes;
        if (broken.IsEmpty())
            continue;
        broken.Resize(broken.Size() - 1); // irredundant: each term is needed
        EXPECT_FALSE(IsSumOf(table, broken, options.isInverted, work));
    }
}

TEST(Minimise, ComplementAndTautologyAgreeWithRows)
{
    std::mt19937_64 random(3);
    for (int round = 0; round < 200; ++round) {
        const CubeSpace space(9, 1);
        CubeList cubes(1);
        for (auto count = static_cast<size_t>(random() % 12); count-- > 0;) {
            uint64_t cube = uint64_t(1) << space.OutputBit(0);
            for (size_t input = 0; input < 9; ++input)
                cube |= (random() % 3 == 0 ? 1 + random() % 2 : 3) << (2 * input);
            cubes.Append(&cube);
        }
        Work work;
        const CubeList off = Complement(space, cubes, CubeList(1), work);
        for (size_t row = 0; row < 512; ++row) {
            size_t numOn = 0;
            size_t numOff = 0;
            for (size_t index = 0; index < cubes.Size(); ++index)
                numOn += HasRow(space, cubes.At(index), row) ? 1 : 0;
            for (size_t index = 0; index < off.Size(); ++index)
                numOff += HasRow(space, off.At(index), row) ? 1 : 0;
            EXPECT_NE(numOn > 0, numOff > 0) << "row " << row;
        }
        const uint64_t all = space.All(0);
        EXPECT_EQ(IsCovered(space, &all, cubes, CubeList(1), work), off.IsEmpty());
    }
}

TEST(Minimise, CoveringIsSolvedToTheEnd)
{
    std::mt19937_64 random(8);
    for (int round = 0; round < 100; ++round) {
        CoveringProblem problem;
        for (size_t column = 0; column < 10; ++column)
            problem.costs.push_back(1 + random() % 4);
        for (size_t row = 0; row < 9; ++row) {
            std::vector<uint32_t> columns;
            for (uint32_t column = 0; column < 10; ++column)
                if (random() % 4 == 0 || column == row)
                    columns.push_back(column);
            problem.rows.push_back(columns);
        }
        uint64_t best = UINT64_MAX;
        for (uint32_t chosen = 0; chosen < 1024; ++chosen) {
            uint64_t cost = 0;
            for (uint32_t column = 0; column < 10; ++column)
                cost += (chosen >> column & 1) != 0 ? problem.costs[column] : 0;
            const bool isCover = std::all_of(
                problem.rows.begin(), problem.rows.end(), [&](const std::vector<uint32_t>& row) {
                    return std::any_of(row.begin(), row.end(), [&](uint32_t column) {
                        return (chosen >> column & 1) != 0;
                    });
                });
            best = isCover ? std::min(best, cost) : best;
        }
        Work work;
        const CoveringResult result = SolveCovering(problem, UINT64_MAX, work);
        EXPECT_EQ(result.cost, best);
        EXPECT_EQ(result.lowerBound, best);
    }
}

TEST(Minimise, TwoHundredInputsWithOneCube)
{
    std::string text = ".i 200\n.o 1\n" + std::string(200, '1') + " 1\n";
    Pla table;
    PlaFault fault;
    ASSERT_TRUE(ReadPla(text, table, fault));
    const Sum sum = Minimised(table, SumOptions());
    EXPECT_EQ(sum.cost.numTerms, 1u);
    EXPECT_EQ(sum.cost.numLiterals, 200u);
    EXPECT_TRUE(sum.isProved);
}

TEST(Minimise, NothingOnAndEverythingFree)
{
    EXPECT_EQ(Minimised(FromRows({"0000"}, 2), SumOptions()).cost.numTerms, 0u);
    EXPECT_EQ(Minimised(FromRows({"----"}, 2), SumOptions()).cost.numTerms, 0u);
    EXPECT_EQ(Minimised(FromRows({"1111"}, 2), SumOptions()).cost.numTerms, 1u);
    EXPECT_EQ(Minimised(FromRows({"1-1-"}, 2), SumOptions()).cost.numLiterals, 0u);
}

TEST(Minimise, EquationsOfManyInputsGoByCubes)
{
    std::string text = "(v0 & v1)";
    for (size_t input = 2; input < 20; input += 2)
        text += " | (v" + std::to_string(input) + " & ~v" + std::to_string(input + 1) + ")";
    const TableOutput output = {"f", Parsed(text), false, Expression()};
    Work work;
    Pla table;
    PlaFault fault;
    ASSERT_TRUE(TableOf({output}, InputsOf({output}), table, fault, work)) << fault.message;
    const Sum sum = Minimised(table, SumOptions());
    EXPECT_EQ(sum.cost.numTerms, 10u);
    EXPECT_TRUE(sum.isProved);
    EXPECT_EQ(ExpressionOf(table, sum.cubes, 0, false).names.size(), 20u);
}

TEST(Minimise, RefusesEquationsOfTooManyProducts)
{
    std::string text = "v0";
    for (size_t input = 1; input < 30; ++input)
        text += " ^ v" + std::to_string(input);
    const TableOutput output = {"parity", Parsed(text), false, Expression()};
    Work work;
    Pla table;
    PlaFault fault;
    EXPECT_FALSE(TableOf({output}, InputsOf({output}), table, fault, work));
    EXPECT_NE(fault.message.find("parity"), std::string::npos) << fault.message;
    EXPECT_FALSE(fault.hint.empty());
}

std::string FaultOf(const std::string& text)
{
    Pla table;
    PlaFault fault;
    Work work;
    if (ReadPla(text, table, fault)) {
        TwoLevelProblem problem(table.space);
        if (IsConsistent(table, fault, work) && ToProblem(table, problem, fault, work))
            return "none";
    }
    return std::to_string(fault.line) + ": " + fault.message;
}

TEST(PlaReader, NamesTheLineOfAFault)
{
    EXPECT_EQ(FaultOf("title\n.i 2\n.o 1\n# c\n1- | 1 # on\n.e\nignored"), "none");
    EXPECT_EQ(FaultOf(".o 1\n.i 2\n1\n-\n1\n"), "none");
    EXPECT_EQ(FaultOf("11 1\n"), "1: a row before .i");
    EXPECT_EQ(FaultOf(".i 2\n11 1\n"), "2: a row before .o");
    EXPECT_EQ(FaultOf(".i 2\n.o 1\n11\n"),
              "3: the row has 2 digits, not 3 (2 inputs and 1 output)");
    EXPECT_EQ(FaultOf(".i 2\n.o 1\n111 1\n"),
              "3: the row is longer than 3 (2 inputs and 1 output)");
    EXPECT_EQ(FaultOf(".i 2\n.o 2\n1 111\n"), "3: 1 digit before the blank, but .i is 2");
    EXPECT_EQ(FaultOf(".i 2\n.o 1\n.phase 1\n"), "3: unknown directive '.phase'");
    EXPECT_EQ(FaultOf(".i 2\n.o 1\n1a 1\n"),
              "3: 'a' is not a digit of an input, at character 2 of the row");
    EXPECT_EQ(FaultOf(".i 2\n.o 2\n.ob f f\n"), "3: the output 'f' is named twice");
    EXPECT_EQ(FaultOf(".i 2\n.o 2\n.ob f\n"), "3: .ob has 1 name for 2 outputs");
    EXPECT_EQ(FaultOf(".i 2\n.i 3\n"), "2: .i is 3 here and was 2 before");
    EXPECT_EQ(FaultOf(".i x\n"), "1: .i needs one number");
    EXPECT_EQ(FaultOf(".i 2\n.o 1\n.type q\n"), "3: .type needs one of f, fd, fr, fdr");
    EXPECT_EQ(FaultOf(".i 2\n.o 1\n1- 1\n.type fr\n11 0\n"),
              "5: lines 3 and 5 contradict each other: output o0 is both 1 and 0 in a row");
    EXPECT_EQ(FaultOf(""), "1: no .i in the file");
}

TEST(PlaReader, DigitsMeanWhatTheTypeSays)
{
    const auto count = [](const std::string& type) {
        Pla table;
        PlaFault fault;
        EXPECT_TRUE(ReadPla(".i 1\n.o 1\n.type " + type + "\n0 1\n1 0\n- -\n- ~\n", table, fault));
        return std::vector<size_t>{table.on.Size(), table.free.Size(), table.off.Size()};
    };
    EXPECT_EQ(count("f"), (std::vector<size_t>{1, 0, 0}));
    EXPECT_EQ(count("fd"), (std::vector<size_t>{1, 1, 0}));
    EXPECT_EQ(count("fr"), (std::vector<size_t>{1, 0, 1}));
    EXPECT_EQ(count("fdr"), (std::vector<size_t>{1, 1, 1}));
}

TEST(PlaReader, WhatIsWrittenReadsBack)
{
    std::mt19937_64 random(21);
    const Rows rows = RandomRows(6, 3, random);
    const Pla table = FromRows(rows, 6);
    const Sum sum = Minimised(table, SumOptions());
    Pla again;
    PlaFault fault;
    ASSERT_TRUE(ReadPla(WritePla(table, sum.cubes), again, fault)) << fault.message;
    EXPECT_EQ(FirstMistake(again.space, rows, again.on, false), SIZE_MAX);
    EXPECT_EQ(again.on.Size(), sum.cubes.Size());
}

TEST(CsvReader, RowsThatAreNotListedAreFree)
{
    Pla table;
    PlaFault fault;
    ASSERT_TRUE(ReadCsv("a,b,f\n0,0,0\n1,1,1\n", 1, table, fault));
    const Sum sum = Minimised(table, SumOptions());
    EXPECT_EQ(sum.cost.numLiterals, 1u);
    EXPECT_FALSE(ReadCsv("a,b,f\n0,0\n", 1, table, fault));
    EXPECT_EQ(fault.line, 2u);
    EXPECT_FALSE(ReadCsv("a,a,f\n", 1, table, fault));
    EXPECT_FALSE(ReadCsv("a,f\n2,1\n", 1, table, fault));
}

} // namespace
