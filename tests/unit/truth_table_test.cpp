// Truth tables: rows, names, comparison, and equations without one.
#include <gtest/gtest.h>

#include <stdexcept>

#include "support/random_text.h"
#include "unit_support.h"

namespace {

typedef Engine::TruthTable Table;

// "A B | 00=0 01=1 ..."
std::string TableText(const Table& table)
{
    std::string text;
    for (const String& name : table.GetVariableNames())
        text += Std(name) + " ";
    text += "|";
    for (const Table::Row& row : table.GetRows()) {
        text += " ";
        for (const unsigned int value : row.GetVariableValues())
            text += std::to_string(value);
        text += "=" + std::to_string(row.GetResultValue());
    }
    return text;
}

std::string TableOf(const char* text)
{
    Engine engine;
    engine.SetEquation(text);
    return TableText(engine.GetTruthTable());
}

TEST(TruthTable, RowsCountUpWithTheFirstVariableMostSignificant)
{
    EXPECT_EQ("A B | 00=0 01=0 10=0 11=1", TableOf("A & B"));
    EXPECT_EQ("A B | 00=0 01=0 10=1 11=0", TableOf("A & ~B"));
    EXPECT_EQ("C A | 00=1 01=0 10=1 11=1", TableOf("C | ~A"));
    EXPECT_EQ("A | 0=1 1=0", TableOf("~A"));
}

TEST(TruthTable, ConstantsAndUnsetEquationsHaveNone)
{
    for (const char* text : {"0", "1", "(1 & 0)", "()", ""}) {
        Engine engine;
        engine.SetEquation(text);
        const Table table = engine.GetTruthTable();
        EXPECT_TRUE(!table) << text;
        EXPECT_FALSE(static_cast<bool>(table.operator Kq_PtrTester*()));
        EXPECT_TRUE(table.GetRows().empty());
        EXPECT_TRUE(table.GetVariableNames().empty());
    }
}

TEST(TruthTable, VariablesWithoutATreeHaveNone)
{
    Engine engine;
    engine.DefineVariable("A", 1);
    EXPECT_TRUE(!engine.GetTruthTable());
}

TEST(TruthTable, ThirtyOneVariablesHaveNone)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("A"));
    for (int number = 1; number < 31; ++number)
        engine.DefineVariable(("v" + std::to_string(number)).c_str(), 0);
    ASSERT_EQ(31u, engine.GetNumVariables());
    EXPECT_TRUE(!engine.GetTruthTable());
    EXPECT_EQ("0x0", Std(engine.GetEquationAsHexInitValue(false)));
    EXPECT_EQ("0b", Std(engine.GetEquationAsBinaryInitValue()));
}

TEST(TruthTable, VariablesDefinedAfterwardsWidenTheTable)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("1"));
    engine.DefineVariable("A", 1);
    EXPECT_EQ("A | 0=1 1=1", TableText(engine.GetTruthTable()));
}

TEST(TruthTable, TabulatingKeepsTheValuesSet)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("A | B"));
    engine.SetVariable("B", 1);
    engine.GetTruthTable();
    EXPECT_EQ("A0 B1", VariablesOf(engine));
}

TEST(TruthTable, ComparisonIsByNamesAndRows)
{
    Engine ab;
    Engine same;
    Engine ba;
    ASSERT_TRUE(ab.SetEquation("A & B"));
    ASSERT_TRUE(same.SetEquation("~(~A | ~B)"));
    ASSERT_TRUE(ba.SetEquation("B & A"));
    EXPECT_TRUE(ab.GetTruthTable() == same.GetTruthTable()) << "the text does not count";
    EXPECT_TRUE(ab.GetTruthTable() != ba.GetTruthTable()) << "the order of names does";
    ASSERT_TRUE(ba.SetEquationWithExplicitTerms({"A", "B"}, "B & A", false, false));
    EXPECT_TRUE(ab.GetTruthTable() == ba.GetTruthTable());
    ASSERT_TRUE(same.SetEquation("A | B"));
    EXPECT_TRUE(ab.GetTruthTable() != same.GetTruthTable());
    ASSERT_TRUE(same.SetEquation("A"));
    EXPECT_TRUE(ab.GetTruthTable() != same.GetTruthTable());
    EXPECT_TRUE(Table() == Table());
    EXPECT_TRUE(Table() != ab.GetTruthTable());
}

TEST(TruthTable, TablesAreValues)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("A ^ B"));
    Table table(engine);
    const Table copy(table);
    ASSERT_TRUE(engine.SetEquation("C"));
    EXPECT_EQ("A B | 00=0 01=1 10=1 11=0", TableText(copy));
    table = engine;
    EXPECT_EQ("C | 0=0 1=1", TableText(table));
    table = copy;
    EXPECT_TRUE(table == copy);
    const Table& same = table;
    table = same;
    EXPECT_TRUE(table == copy);
    ASSERT_TRUE(engine.SetEquation("1"));
    table = engine;
    EXPECT_TRUE(!table);
}

TEST(TruthTable, RowsCompareByResultAndValues)
{
    const Table::Row row(1, {0, 1});
    EXPECT_TRUE(row == Table::Row(1, {0, 1}));
    EXPECT_TRUE(row != Table::Row(0, {0, 1}));
    EXPECT_TRUE(row != Table::Row(1, {0, 0}));
    EXPECT_TRUE(row != Table::Row(1, {0, 1, 0}));
    Table::Row assigned(0, {});
    assigned = row;
    EXPECT_TRUE(assigned == row);
}

TEST(TruthTable, DebugModeTracesAndDumpsEveryRow)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("A"));
    std::string expected;
    for (const char* value : {"0", "1"})
        expected += std::string("DEBUG:../s/Kq_BoolEquationImpNode.cpp:446 Eval TOP. type=ID "
                                "token=A value=") +
                    value + "\nNODE: TOP. parent= type=ID token=A val=0\n";
    const DebugMode debugMode;
    Messages messages;
    const Table table = engine.GetTruthTable();
    EXPECT_EQ(expected, messages.Text());
    EXPECT_EQ("A | 0=0 1=1", TableText(table));
    EXPECT_EQ("0x2", Std(engine.GetEquationAsHexInitValue(false)));
    EXPECT_EQ(expected + expected, messages.Text()) << "an init value traces the rows too";
}

TEST(TruthTable, ReceiverOfATraceMayClearTheEquation)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("A & B"));
    const DebugMode debugMode;
    const Port_MsgManData::Sink before = Port_MsgManData::setSink(
        [&](const char*, const char*, int, const char*, const char*) { engine.Clear(); });
    const Table table(engine);
    Port_MsgManData::setSink(before);
    EXPECT_EQ("A B | 00=0 01=0 10=0 11=1", TableText(table));
    EXPECT_TRUE(!engine);
}

// Small and large tables against node-by-node evaluation of every row.
TEST(TruthTable, EveryRowIsWhatEvalGives)
{
    const char* texts[] = {"a & b | c ^ d ~& e ~| f ~^ g",
                           "~(a ^ (b | (c & (d ^ (e | (f & (g ^ (h | ~i))))))))",
                           "a ~ | b & c ~ ^ d | e",
                           "((a & b) | (c & d)) ^ ((e | f) & (g | h)) ~^ ((i ~| j) ~& (k ^ 1))",
                           "a",
                           "a & ()"};
    for (const char* text : texts) {
        Engine engine;
        ASSERT_TRUE(engine.SetEquation(text)) << text;
        for (const char* extra : {"", "x", "y"}) {
            engine.DefineVariable(extra, 1);
            const Table table = engine.GetTruthTable();
            ASSERT_EQ(size_t(1) << engine.GetNumVariables(), table.GetRows().size());
            std::vector<std::pair<String, unsigned int>> values = engine.GetVariables();
            for (const Table::Row& row : table.GetRows()) {
                for (size_t column = 0; column < values.size(); ++column)
                    values[column].second = row.GetVariableValues()[column];
                ASSERT_EQ(engine.GetRoot()->Eval(values), row.GetResultValue()) << text;
            }
        }
    }
}

// More rows than are computed at a time.
TEST(TruthTable, ManyRowsAreWhatEvalGives)
{
    std::string text = "v0";
    for (int number = 1; number < 16; ++number)
        text = "(" + text + (number % 3 != 0 ? ") ^ v" : ") | ~v") + std::to_string(number);
    Engine engine;
    ASSERT_TRUE(engine.SetEquation(text.c_str()));
    std::vector<std::pair<String, unsigned int>> values = engine.GetVariables();
    const Table table = engine.GetTruthTable();
    ASSERT_EQ(65536u, table.GetRows().size());
    for (const Table::Row& row : table.GetRows()) {
        for (size_t column = 0; column < values.size(); ++column)
            values[column].second = row.GetVariableValues()[column];
        ASSERT_EQ(engine.GetRoot()->Eval(values), row.GetResultValue());
    }
}

// The column that the library gives must equal the rows of the truth table.
void ExpectColumnIsTheRows(const Engine& engine)
{
    std::vector<uint64_t> words(3, 7);
    ASSERT_TRUE(engine.GetColumn(words));
    const auto rows = engine.GetTruthTable().GetRows();
    ASSERT_EQ((rows.size() + 63) / 64, words.size());
    for (size_t row = 0; row < words.size() * 64; ++row) {
        const unsigned int expected = row < rows.size() ? rows[row].GetResultValue() : 0;
        ASSERT_EQ(expected, words[row / 64] >> (row % 64) & 1u) << "row " << row;
    }
}

TEST(TruthTable, ColumnIsTheRowsPackedWithZerosBehindThem)
{
    std::string text = "~v1";
    for (int numVariables = 1; numVariables <= 12; ++numVariables) {
        Engine engine;
        ASSERT_TRUE(engine.SetEquation(text.c_str()));
        ExpectColumnIsTheRows(engine);
        const std::string next = "v" + std::to_string(numVariables + 1);
        text = "(" + text + (numVariables % 2 != 0 ? ") ^ " : ") | ~") + next;
    }
}

TEST(TruthTable, ColumnOfAConstantIsOneRow)
{
    for (const char* text : {"0", "1", "()", "~(1 & 0)"}) {
        Engine engine;
        ASSERT_TRUE(engine.SetEquation(text));
        std::vector<uint64_t> words;
        ASSERT_TRUE(engine.GetColumn(words)) << text;
        EXPECT_EQ(std::vector<uint64_t>(1, engine.Eval()), words) << text;
    }
}

TEST(TruthTable, ColumnIsRefusedWithoutEquationAndAboveThirtyVariables)
{
    std::vector<uint64_t> words(1, 1);
    Engine engine;
    EXPECT_FALSE(engine.GetColumn(words));
    EXPECT_TRUE(words.empty());
    ASSERT_TRUE(engine.SetEquation("A"));
    for (int number = 1; number < 31; ++number)
        engine.DefineVariable(("v" + std::to_string(number)).c_str(), 0);
    words.assign(1, 1);
    EXPECT_FALSE(engine.GetColumn(words));
    EXPECT_TRUE(words.empty());
}

// An exclusive-or of so many products over 'numVariables' variables that the column for 19 takes
// several pieces.
std::string LongText(size_t numVariables)
{
    support::RandomText random(20);
    const auto name = [&] { return "v" + std::to_string(random.Below(numVariables)); };
    std::string text = "v0";
    for (size_t number = 1; number < numVariables; ++number)
        text += " ^ v" + std::to_string(number);
    for (int product = 0; product < 3000; ++product)
        text += " ^ (" + name() + " & " + (random.Chance(50) ? "~" : "") + name() + " & " + name() +
                ")";
    return text;
}

bool CountDown(void* context)
{
    int& left = *static_cast<int*>(context);
    return left-- > 0;
}

TEST(TruthTable, ColumnInPiecesIsTheColumn)
{
    for (const size_t numVariables : {3u, 12u, 16u, 19u, 20u}) {
        Engine engine;
        ASSERT_TRUE(engine.SetEquation(LongText(numVariables).c_str()));
        std::vector<uint64_t> whole;
        ASSERT_TRUE(engine.GetColumn(whole));
        constexpr int kMany = 1000000;
        int left = kMany;
        std::vector<uint64_t> words(1, 7);
        ASSERT_TRUE(engine.GetColumn(words, CountDown, &left));
        EXPECT_EQ(whole, words);
        EXPECT_EQ(numVariables >= 19, kMany - left > 1) << kMany - left << " pieces";
    }
}

TEST(TruthTable, ColumnStopsWhenItIsTold)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation(LongText(20).c_str()));
    for (const int numPieces : {0, 1, 3}) {
        int left = numPieces;
        std::vector<uint64_t> words(1, 7);
        EXPECT_FALSE(engine.GetColumn(words, CountDown, &left));
        EXPECT_TRUE(words.empty());
        EXPECT_EQ(-1, left);
    }
    std::vector<uint64_t> words;
    EXPECT_TRUE(engine.GetColumn(words)); // nothing remains of the stopped calls
    EXPECT_EQ(size_t(1) << 14, words.size());
}

TEST(TruthTable, ColumnOfAnInitValueIsOnePiece)
{
    const std::vector<String> terms = {"A", "B", "C"};
    Engine engine;
    ASSERT_TRUE(engine.SetEquationWithExplicitTerms(terms, "0xca", false, false));
    for (const int numPieces : {0, 1}) {
        int left = numPieces;
        std::vector<uint64_t> words;
        EXPECT_EQ(numPieces == 1, engine.GetColumn(words, CountDown, &left));
        EXPECT_EQ(std::vector<uint64_t>(static_cast<size_t>(numPieces), 0xca), words);
    }
}

TEST(TruthTable, WhatColumnAsksMayThrow)
{
    Kq_BoolEquation equation;
    ASSERT_TRUE(equation.SetEquation("A & ~B | C"));
    std::vector<uint64_t> words(1, 7);
    const auto thrower = [](void*) -> bool { throw std::runtime_error("stop"); };
    EXPECT_THROW(equation.GetColumn(words, thrower, nullptr), std::runtime_error);
    EXPECT_TRUE(words.empty());
    EXPECT_TRUE(equation.GetColumn(words, nullptr, nullptr));
    EXPECT_EQ(std::vector<uint64_t>(1, 0xba), words);
}

// For few variables, for an init value's digits, and for a tree in several pieces.
TEST(TruthTable, WhatColumnAsksMaySetClearOrDestroyTheEquation)
{
    std::string wide = "x0";
    for (unsigned int index = 1; index < 22; ++index)
        wide += (index % 3 == 0 ? " ^ x" : " | ~x") + std::to_string(index);
    for (unsigned int depth = 0; depth < 2000; ++depth)
        wide += " ^ (x" + std::to_string(depth % 21) + " & x" + std::to_string(depth % 19) + ")";
    struct Asked {
        std::unique_ptr<Kq_BoolEquation> equation;
        unsigned int deed;
        unsigned int numCalls;
    };
    const auto change = [](void* context) {
        Asked& asked = *static_cast<Asked*>(context);
        if (++asked.numCalls > 1)
            return true;
        if (asked.deed == 0)
            asked.equation.reset();
        else if (asked.deed == 1)
            asked.equation->Clear();
        else
            EXPECT_TRUE(asked.equation->SetEquation("a ^ b & c | d ^ e & f ^ g"));
        return true;
    };
    const std::string digits = "0x" + std::string(200, '6') + std::string(56, 'a');
    for (const std::string& text : {std::string("A & ~B"), wide, digits}) {
        for (unsigned int deed = 0; deed < 3; ++deed) {
            Asked asked = {std::make_unique<Kq_BoolEquation>(), deed, 0};
            std::vector<String> terms;
            for (unsigned int index = 0; text == digits && index < 10; ++index)
                terms.push_back(("t" + std::to_string(index)).c_str());
            ASSERT_TRUE(
                asked.equation->SetEquationWithExplicitTerms(terms, text.c_str(), false, false));
            std::vector<uint64_t> expected;
            ASSERT_TRUE(asked.equation->GetColumn(expected));
            std::vector<uint64_t> words;
            EXPECT_TRUE(asked.equation->GetColumn(words, change, &asked));
            EXPECT_TRUE(expected == words) << text.substr(0, 20) << " " << deed;
            EXPECT_EQ(text == wide, asked.numCalls > 1);
        }
    }
}

TEST(TruthTable, ColumnIsTheSameInDebugModeAndSilent)
{
    Kq_BoolEquation equation;
    ASSERT_TRUE(equation.SetEquation("A & ~B | C"));
    std::vector<uint64_t> words;
    ASSERT_TRUE(equation.GetColumn(words));
    const Messages messages;
    const DebugMode debugMode;
    std::vector<uint64_t> traced;
    ASSERT_TRUE(equation.GetColumn(traced));
    EXPECT_EQ(words, traced);
    EXPECT_EQ(std::vector<uint64_t>(1, 0xba), words);
    EXPECT_EQ("", messages.Text());
}

} // namespace
