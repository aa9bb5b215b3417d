// The packed result column and its kernels, each by name, against evaluation node by node; also the
// program that they run.
#include <algorithm>
#include <cstdlib>
#include <random>

#include <gtest/gtest.h>

#include "Column.h"
#include "unit_support.h"

namespace {

typedef std::vector<std::pair<String, unsigned int>> Table;

// Variables x0, x1, ... with value 0.
std::vector<String> Names(unsigned int numVariables)
{
    std::vector<String> names;
    for (unsigned int index = 0; index < numVariables; ++index)
        names.push_back(("x" + std::to_string(index)).c_str());
    return names;
}

Engine MakeEngine(const std::string& text, unsigned int numVariables)
{
    // Over listed inputs a text that starts with 0 is an init value or is refused.
    const std::string guarded =
        text.compare(0, 2, "0 ") == 0 || text == "0" ? "(" + text + ")" : text;
    Engine engine;
    EXPECT_TRUE(
        engine.SetEquationWithExplicitTerms(Names(numVariables), guarded.c_str(), false, false))
        << text;
    EXPECT_EQ(numVariables, engine.GetNumVariables());
    return engine;
}

unsigned int EvalRow(const Node& root, Table& table, uint64_t row)
{
    for (size_t index = 0; index < table.size(); ++index)
        table[index].second = row >> (table.size() - 1 - index) & 1u;
    return root.Eval(table);
}

// Compares all rows, or some thousand of them if there are more.
void ExpectColumn(const Engine& engine, const std::vector<uint64_t>& words, const std::string& what)
{
    Table table = engine.GetVariables();
    const uint64_t numRows = uint64_t(1) << table.size();
    const uint64_t step = std::max<uint64_t>(1, numRows / 4096) | 1u;
    for (uint64_t row = 0; row < numRows; row += step)
        ASSERT_EQ(EvalRow(*engine.GetRoot(), table, row),
                  words[static_cast<size_t>(row / 64)] >> (row % 64) & 1u)
            << what << ", row " << row;
}

std::vector<uint64_t> WholeColumn(const Engine& engine)
{
    KqColumn column(engine.GetRoot(), engine.GetNumVariables());
    std::vector<uint64_t> words(column.GetNumWords());
    column.Fill(0, words.size(), words.data());
    return words;
}

const char* const kOperators[] = {" & ", " | ", " ^ ", " ~& ", " ~| ", " ~^ "};

std::string RandomOperand(std::mt19937& random, unsigned int numVariables)
{
    if (random() % 16 == 0)
        return random() % 2 != 0 ? "1" : "0";
    return (random() % 4 == 0 ? "~x" : "x") + std::to_string(random() % numVariables);
}

// A text without groups, grouped from the left.
std::string RandomChain(std::mt19937& random, unsigned int numVariables, unsigned int numOperators)
{
    std::string text = RandomOperand(random, numVariables);
    for (unsigned int count = 0; count < numOperators; ++count)
        text += kOperators[random() % 6] + RandomOperand(random, numVariables);
    return text;
}

// A text of groups within groups.
std::string RandomGroups(std::mt19937& random, unsigned int numVariables, unsigned int numOperators)
{
    std::vector<std::string> parts;
    for (unsigned int count = 0; count <= numOperators; ++count)
        parts.push_back(RandomOperand(random, numVariables));
    while (parts.size() > 1) {
        const size_t taken = random() % parts.size();
        const std::string left = parts[taken];
        parts.erase(parts.begin() + static_cast<std::ptrdiff_t>(taken));
        std::string& right = parts[random() % parts.size()];
        right = (random() % 4 == 0 ? "~(" : "(") + left + kOperators[random() % 6] + right + ")";
    }
    return parts[0];
}

TEST(Column, EveryNumberOfVariables)
{
    std::mt19937 random(20261);
    for (unsigned int numVariables = 1; numVariables <= 20; ++numVariables) {
        for (unsigned int count = 0; count < (numVariables > 14 ? 6u : 40u); ++count) {
            const std::string text = count % 2 != 0
                                         ? RandomChain(random, numVariables, 2 * numVariables)
                                         : RandomGroups(random, numVariables, 2 * numVariables);
            const Engine engine = MakeEngine(text, numVariables);
            ExpectColumn(engine, WholeColumn(engine), text);
        }
    }
}

TEST(Column, FewVariablesRepeatUpToTheEndOfTheWord)
{
    EXPECT_EQ(0xaaaaaaaaaaaaaaaau, WholeColumn(MakeEngine("x0", 1))[0]);
    EXPECT_EQ(0x8888888888888888u, WholeColumn(MakeEngine("x0 & x1", 2))[0]);
    EXPECT_EQ(0x8080808080808080u, WholeColumn(MakeEngine("x0 & x1 & x2", 3))[0]);
    EXPECT_EQ(~uint64_t(0), WholeColumn(MakeEngine("1", 3))[0]);
}

TEST(Column, FewVariablesAreOneWord)
{
    for (unsigned int numVariables = 1; numVariables <= 8; ++numVariables) {
        const Engine engine = MakeEngine("x0", numVariables);
        EXPECT_EQ(numVariables <= 6 ? 1u : 1u << (numVariables - 6),
                  KqColumn(engine.GetRoot(), numVariables).GetNumWords());
    }
}

// A repeated block is copied only if it is small.
TEST(Column, LargeBlocksThatAreMetAgain)
{
    std::string rest = "x21";
    for (unsigned int index = 21; index-- > 1;)
        rest = "(" + rest + (index % 3 != 0 ? ") ^ ~x" : ") | x") + std::to_string(index);
    const Engine engine = MakeEngine("(" + rest + ") ^ x0", 22);
    ExpectColumn(engine, WholeColumn(engine), rest);
}

// A program that stays long while variables are fixed: remainders are discarded in between.
TEST(Column, LongProgramsOverManyVariables)
{
    std::mt19937 random(20268);
    std::string text = "x0";
    for (unsigned int term = 0; term < 2000; ++term) {
        text += " ^ (x" + std::to_string(random() % 19);
        text += " & x" + std::to_string(random() % 19);
        text += " & x" + std::to_string(random() % 19) + ")";
    }
    const Engine engine = MakeEngine(text, 19);
    ExpectColumn(engine, WholeColumn(engine), "long");
}

TEST(Column, MissingTreeIsZeroAndForeignVariablesAreZero)
{
    uint64_t word = 1;
    KqColumn(nullptr, 3).Fill(0, 1, &word);
    EXPECT_EQ(0u, word);
    const Engine engine = MakeEngine("x0 | x3", 4);
    KqColumn(engine.GetRoot(), 2).Fill(0, 1, &word);
    EXPECT_EQ(0xccccccccccccccccu, word) << "x3 is not a variable of two";
}

TEST(Column, PiecesInAnyOrderAreThoseOfTheWhole)
{
    std::mt19937 random(20262);
    for (unsigned int count = 0; count < 30; ++count) {
        const unsigned int numVariables = 15 + count % 3;
        const std::string text = count % 2 != 0 ? RandomChain(random, numVariables, 40)
                                                : RandomGroups(random, numVariables, 40);
        const Engine engine = MakeEngine(text, numVariables);
        const std::vector<uint64_t> whole = WholeColumn(engine);
        KqColumn column(engine.GetRoot(), numVariables);
        for (unsigned int piece = 0; piece < 60; ++piece) {
            const size_t first = random() % whole.size();
            const size_t length = 1 + random() % std::min<size_t>(whole.size() - first, 700);
            std::vector<uint64_t> words(length);
            column.Fill(first, length, words.data());
            ASSERT_TRUE(std::equal(words.begin(), words.end(),
                                   whole.begin() + static_cast<std::ptrdiff_t>(first)))
                << text << ", words " << first << " to " << first + length;
        }
        for (size_t end = whole.size(); end > 0; end -= 64) {
            std::vector<uint64_t> words(64);
            column.Fill(end - 64, 64, words.data());
            ASSERT_TRUE(std::equal(words.begin(), words.end(),
                                   whole.begin() + static_cast<std::ptrdiff_t>(end - 64)));
        }
    }
}

TEST(Column, SmallPieceAfterALargeOneIsThatOfTheWhole)
{
    const Engine engine = MakeEngine("x0^x1&x2|x3&x4^x5|x6|x7^x8&x9|x10|x11&x12^x13^x14&x15", 16);
    const std::vector<uint64_t> whole = WholeColumn(engine);
    KqColumn column(engine.GetRoot(), 16);
    std::mt19937 random(20267);
    for (unsigned int count = 0; count < 2000; ++count) {
        const size_t length = size_t(1) << random() % 11;
        const size_t first = random() % (whole.size() / length) * length;
        std::vector<uint64_t> words(length);
        column.Fill(first, length, words.data());
        ASSERT_TRUE(std::equal(words.begin(), words.end(),
                               whole.begin() + static_cast<std::ptrdiff_t>(first)))
            << first << ", " << length;
    }
}

TEST(Column, ThirtyVariablesInPieces)
{
    std::mt19937 random(20263);
    const Engine engine = MakeEngine(RandomChain(random, 30, 60), 30);
    KqColumn column(engine.GetRoot(), 30);
    ASSERT_EQ(uint64_t(1) << 24, column.GetNumWords());
    Table table = engine.GetVariables();
    std::vector<uint64_t> words(64);
    for (unsigned int count = 0; count < 300; ++count) {
        const uint64_t first = random() % (column.GetNumWords() / 64) * 64;
        column.Fill(first, 64, words.data());
        const uint64_t row = random() % 4096;
        ASSERT_EQ(EvalRow(*engine.GetRoot(), table, first * 64 + row),
                  words[static_cast<size_t>(row / 64)] >> (row % 64) & 1u);
    }
}

TEST(Column, ManyTermsOverFewVariables)
{
    std::mt19937 random(20264);
    std::string value = "0x";
    for (unsigned int digit = 0; digit < 256; ++digit)
        value += "0123456789abcdef"[random() % 16];
    const Engine engine = MakeEngine(value, 10);
    ExpectColumn(engine, WholeColumn(engine), value);
    // The same terms, in an order that shares nothing.
    const std::string text = RandomChain(random, 12, 5000);
    ExpectColumn(MakeEngine(text, 12), WholeColumn(MakeEngine(text, 12)), "5000 operators");
}

// Remainders after fixing a variable are kept while there is room; these programs leave more.
TEST(Column, ManyOperatorsOverManyVariables)
{
    std::mt19937 random(20268);
    const Engine engine = MakeEngine(RandomGroups(random, 20, 2500), 20);
    ExpectColumn(engine, WholeColumn(engine), "2500 operators");
}

// Blocks that are too large to copy: each half of x0 ^ ... is the complement of the other.
TEST(Column, LargestBlocksAreExpandedAgain)
{
    std::string text = "x0";
    for (unsigned int variable = 1; variable < 22; ++variable)
        text += " ^ x" + std::to_string(variable);
    const Engine engine = MakeEngine(text, 22);
    ExpectColumn(engine, WholeColumn(engine), text);
}

TEST(Column, DeepTreesOfEitherSideNeedLittle)
{
    for (const bool isRightNested : {false, true}) {
        std::string text = "x0";
        for (unsigned int depth = 1; depth < 20000; ++depth) {
            const std::string operand = "(x" + std::to_string(depth % 8) + kOperators[depth % 6] +
                                        "x" + std::to_string(depth * 5 % 8) + ")";
            const char* operation = kOperators[depth % 5 == 0 ? depth % 6 : 2];
            if (isRightNested)
                text.insert(0, operand + operation + "("), text += ")";
            else
                text += operation + operand;
        }
        const Engine engine = MakeEngine(text, 8);
        ExpectColumn(engine, WholeColumn(engine), isRightNested ? "right" : "left");
    }
}

// Each kernel against the plain one, word by word, on programs and blocks of several sizes.
TEST(Column, EveryKernelGivesWhatThePlainOneGives)
{
    size_t numKernels = 0;
    const KqNamedKernel* kernels = KqGetKernels(&numKernels);
    ASSERT_STREQ("plain", kernels[0].name);
    std::mt19937 random(20265);
    std::vector<uint64_t> stack(kKqMaxStack * kKqTileWords + 8);
    for (size_t index = 0; index < numKernels; ++index) {
        if (!kernels[index].isSupported()) {
            std::printf("kernel %s: not supported by this processor, skipped\n",
                        kernels[index].name);
            continue;
        }
        size_t numCases = 0;
        for (unsigned int count = 0; count < 300; ++count) {
            const unsigned int numVariables = 12 + count % 5;
            const std::string text = RandomGroups(random, numVariables, 1 + count % 60);
            const Engine engine = MakeEngine(text, numVariables);
            const KqProgram program = KqCompile(engine.GetRoot(), numVariables, true);
            if (program.numCodes == 0)
                continue;
            std::vector<uint64_t> plain(size_t(1) << (numVariables - 6), 1);
            const size_t shift = count % 8; // memory may start at any multiple of eight bytes
            std::vector<uint64_t> words(plain.size() + shift, 2);
            kernels[0].run(program.codes.data(), program.numCodes, program.isInverted, plain.size(),
                           stack.data(), plain.data());
            ExpectColumn(engine, plain, text);
            kernels[index].run(program.codes.data(), program.numCodes, program.isInverted,
                               plain.size(), stack.data() + shift, words.data() + shift);
            ASSERT_TRUE(std::equal(plain.begin(), plain.end(), words.begin() + ptrdiff_t(shift)))
                << kernels[index].name << ": " << text;
            ++numCases;
        }
        EXPECT_GT(numCases, 200u) << kernels[index].name;
    }
}

TEST(Column, AKernelIsChosenByNameAndOtherwiseTheFastestOneIs)
{
    size_t numKernels = 0;
    const KqNamedKernel* const kernels = KqGetKernels(&numKernels);
    const KqNamedKernel* fastest = kernels;
    for (size_t index = 0; index < numKernels; ++index)
        fastest = kernels[index].isSupported() ? &kernels[index] : fastest;
    for (size_t index = 0; index < numKernels; ++index) {
        const KqNamedKernel* const wanted =
            kernels[index].isSupported() ? &kernels[index] : fastest;
        EXPECT_EQ(wanted, &KqChooseKernel(kernels[index].name)) << kernels[index].name;
    }
    for (const char* name : {"", "plai", "plain ", "PLAIN", "sse9"})
        EXPECT_EQ(fastest, &KqChooseKernel(name)) << name;
    EXPECT_EQ(fastest, &KqChooseKernel(nullptr));
    // The tests columns.kernel_* set the variable.
    EXPECT_EQ(&KqChooseKernel(std::getenv("MAV_KQ_BOOL_EQUATION_KERNEL")), &KqGetKernel());
}

// Blocks made by joins against the plain kernel, with each processor's joins by name. In these
// trees every operand has few variables, so that joins are used.
TEST(Column, JoinsOfEveryKernelGiveWhatThePlainKernelGives)
{
    size_t numKernels = 0;
    const KqNamedKernel* kernels = KqGetKernels(&numKernels);
    std::mt19937 random(20267);
    std::vector<uint64_t> stack(kKqMaxStack * kKqTileWords);
    size_t numTaken = 0;
    for (unsigned int count = 0; count < 400; ++count) {
        const unsigned int numVariables = 12 + count % 6;
        const std::string text = RandomGroups(random, numVariables, 1 + count % 24);
        const Engine engine = MakeEngine(text, numVariables);
        const KqProgram program = KqCompile(engine.GetRoot(), numVariables, true);
        std::vector<uint64_t> plain(size_t(1) << (numVariables - 6), 1);
        kernels[0].run(program.codes.data(), program.numCodes, program.isInverted, plain.size(),
                       stack.data(), plain.data());
        for (size_t index = 0; index < numKernels; ++index) {
            std::vector<uint64_t> words(plain.size(), 2);
            KqJoiner joiner(kernels[index].join);
            if (!kernels[index].isSupported())
                continue;
            if (!joiner.Fill(program.codes.data(), program.numCodes, program.isInverted,
                             numVariables, words.data())) {
                EXPECT_EQ(std::vector<uint64_t>(plain.size(), 2), words) << "nothing is written";
                continue;
            }
            ASSERT_TRUE(plain == words) << kernels[index].name << ": " << text;
            ++numTaken;
        }
    }
    EXPECT_GT(numTaken, 300u);
}

TEST(Column, LargeTreesAreRightWhereverTheirBlocksComeFrom)
{
    std::mt19937 random(20268);
    for (unsigned int count = 0; count < 24; ++count) {
        const unsigned int numVariables = 20 + count % 4;
        const std::string text = RandomGroups(random, numVariables, 2 * numVariables);
        const Engine engine = MakeEngine(text, numVariables);
        const std::vector<uint64_t> words = WholeColumn(engine);
        ExpectColumn(engine, words, text);
        // In pieces, as for writing texts.
        KqColumn column(engine.GetRoot(), numVariables);
        std::vector<uint64_t> piece(2048);
        for (uint64_t first = words.size(); first > 0; first -= piece.size()) {
            column.Fill(first - piece.size(), piece.size(), piece.data());
            ASSERT_TRUE(
                std::equal(piece.begin(), piece.end(),
                           words.begin() + static_cast<std::ptrdiff_t>(first - piece.size())))
                << text;
        }
    }
}

TEST(Program, HasNeitherGroupsNorConstants)
{
    const KqProgram constant =
        KqCompile(MakeEngine("(x0 & 0) | ~(x1 ^ x1) & 1", 2).GetRoot(), 2, false);
    EXPECT_EQ(0u, constant.numCodes);
    EXPECT_TRUE(constant.isInverted);
    const KqProgram variable =
        KqCompile(MakeEngine("~((x1 | 0) & (x1 ^ 0) & 1)", 2).GetRoot(), 2, false);
    ASSERT_EQ(1u, variable.numCodes);
    EXPECT_EQ(1u, KqVariableOf(variable.codes[0]));
    EXPECT_TRUE(variable.isInverted);
    const KqProgram reversed = KqCompile(MakeEngine("x1", 5).GetRoot(), 5, true);
    EXPECT_EQ(3u, KqVariableOf(reversed.codes[0]));
}

// The second and third evaluation run the program.
TEST(Program, EvaluatesAsTheNodesDo)
{
    std::mt19937 random(20266);
    for (unsigned int count = 0; count < 300; ++count) {
        const unsigned int numVariables = 1 + count % 40;
        const std::string text = count % 2 != 0 ? RandomChain(random, numVariables, count % 200)
                                                : RandomGroups(random, numVariables, count % 200);
        Engine engine = MakeEngine(text, numVariables);
        for (unsigned int round = 0; round < 20; ++round) {
            for (unsigned int index = 0; index < numVariables; ++index)
                engine.SetVariable(engine.GetVariables()[index].first, random() & 1u);
            ASSERT_EQ(engine.GetRoot()->Eval(engine.GetVariables()), engine.Eval()) << text;
        }
    }
}

TEST(Program, IsMadeAnewWhenVariablesChange)
{
    Engine engine;
    engine.TokenizeNodes("a ^ b");
    engine.BuildTree();
    EXPECT_EQ(0u, engine.Eval());
    engine.DefineVariable("b", 1);
    EXPECT_EQ(0u, engine.Eval()) << "a and b are both variable 0";
    engine.DefineVariable("a", 0);
    EXPECT_EQ(1u, engine.Eval());
    Engine copy(engine);
    for (const char* name : {"c", "d", "e", "f", "g", "h"}) {
        copy.DefineVariable(name, 1);
        EXPECT_EQ(1u, copy.Eval());
        EXPECT_EQ(1u, copy.Eval());
        EXPECT_EQ(1u, engine.Eval()) << "one tree, two tables";
    }
    copy.SetVariable("a", 1);
    EXPECT_EQ(0u, copy.Eval());
    EXPECT_EQ(1u, engine.Eval());
}

} // namespace
