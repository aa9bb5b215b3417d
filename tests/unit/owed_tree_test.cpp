// An init value's tree is made on demand, which callers cannot notice. It must equal the tree that
// is made at once in debug mode, from the expression's text.
#include <gtest/gtest.h>

#include <random>

#include "unit_support.h"

namespace {

const std::vector<String> kNames = {"a", "b2", "'c d'", "_e", "f", "G", "h", "i",
                                    "j", "k",  "l",     "m",  "n", "o", "p", "q"};

std::vector<String> FirstNames(size_t numNames)
{
    return std::vector<String>(kNames.begin(),
                               kNames.begin() + static_cast<std::ptrdiff_t>(numNames));
}

std::string Digits(std::mt19937& random, size_t numDigits)
{
    std::string text = "0b";
    const size_t density = random() % 9;
    for (size_t digit = 0; digit < numDigits; ++digit)
        text += random() % 8 < density ? '1' : '0';
    return text;
}

std::string DumpOf(const Engine& engine)
{
    const Messages messages;
    engine.Dbg();
    return messages.Text();
}

// Sets the text with its tree made at once.
void SetAtOnce(Engine& engine, const std::vector<String>& names, const String& text,
               bool termOrderFlag)
{
    const Messages messages;
    const DebugMode debugMode;
    ASSERT_TRUE(engine.SetEquationWithExplicitTerms(names, text, termOrderFlag, false));
}

std::vector<std::vector<unsigned int>> HandlesOf(const Engine& engine)
{
    std::vector<std::vector<unsigned int>> handles;
    for (const auto& variable : engine.GetVariables()) {
        const Kq_BoolEquation::Handle handle = engine.GetVariableHandle(variable.first);
        handles.emplace_back(handle.begin(), handle.end());
    }
    return handles;
}

TEST(OwedTree, IsTheOneMadeAtOnce)
{
    std::mt19937 random(1);
    for (size_t numNames = 1; numNames <= 4; ++numNames) {
        const size_t most = size_t(1) << numNames;
        for (size_t numDigits = most / 2 + 1; numDigits <= most; ++numDigits) {
            for (int repeat = 0; repeat < 4; ++repeat) {
                const std::string text = Digits(random, numDigits);
                const bool termOrderFlag = repeat % 2 != 0;
                Engine later;
                ASSERT_TRUE(later.SetEquationWithExplicitTerms(FirstNames(numNames), text.c_str(),
                                                               termOrderFlag, false));
                Engine atOnce;
                SetAtOnce(atOnce, FirstNames(numNames), text.c_str(), termOrderFlag);
                ASSERT_EQ(HandlesOf(atOnce), HandlesOf(later)) << text << ", positions";
                ASSERT_EQ(DumpOf(atOnce), DumpOf(later)) << text;
                ASSERT_EQ(HandlesOf(atOnce), HandlesOf(later)) << text << ", of the tree";
                ASSERT_TRUE(atOnce == later);
            }
        }
    }
}

// Every result, from the digits and from the expression that they stand for, over more variables
// than the value has.
TEST(OwedTree, ResultsComeFromTheDigits)
{
    std::mt19937 random(2);
    for (size_t numNames = 1; numNames <= 10; ++numNames) {
        for (int repeat = 0; repeat < 24; ++repeat) {
            const size_t most = size_t(1) << numNames;
            const std::string text = Digits(random, most - random() % (most / 2));
            Engine value;
            ASSERT_TRUE(value.SetEquationWithExplicitTerms(FirstNames(numNames), text.c_str(),
                                                           repeat % 2 != 0, false));
            Engine expression;
            ASSERT_TRUE(expression.SetEquationWithExplicitTerms(
                FirstNames(numNames), Engine(value).GetEquationAlt2(false), false, false));
            for (int defined = 0; defined < repeat / 2 % 4; ++defined) {
                const std::string name = "more" + std::to_string(defined);
                value.DefineVariable(name.c_str(), 1);
                expression.DefineVariable(name.c_str(), 1);
            }
            ASSERT_EQ(Std(expression.GetEquationAsBinaryInitValue()),
                      Std(value.GetEquationAsBinaryInitValue()))
                << text;
            ASSERT_TRUE(expression.GetTruthTable() == value.GetTruthTable()) << text;
            for (int assignment = 0; assignment < 20; ++assignment) {
                for (const auto& variable : expression.GetVariables()) {
                    const unsigned int isSet = random() % 2 != 0 ? 1 : 0;
                    expression.SetVariable(variable.first, isSet);
                    value.SetVariable(variable.first, isSet);
                }
                ASSERT_EQ(expression.Eval(), value.Eval()) << text;
            }
        }
    }
}

TEST(OwedTree, BitsCountFromEitherEnd)
{
    // The result of row r is digit r; with the flag, the first name is the lowest bit of r.
    std::mt19937 random(3);
    for (size_t numNames : {2u, 5u, 6u, 7u, 12u, 13u, 16u}) {
        const size_t numRows = size_t(1) << numNames;
        const std::string text = Digits(random, numRows);
        Engine engine;
        ASSERT_TRUE(
            engine.SetEquationWithExplicitTerms(FirstNames(numNames), text.c_str(), true, false));
        const std::string rendered = Std(engine.GetEquationAsBinaryInitValue());
        ASSERT_EQ(text.size(), rendered.size());
        for (size_t row = 0; row < numRows; ++row) {
            size_t digit = 0;
            for (size_t bit = 0; bit < numNames; ++bit)
                digit = digit << 1 | (row >> bit & 1u);
            ASSERT_EQ(text[text.size() - 1 - digit], rendered[rendered.size() - 1 - row]) << row;
        }
    }
}

TEST(OwedTree, IsMadeForAllCopies)
{
    Engine first;
    ASSERT_TRUE(first.SetEquationWithExplicitTerms({"A", "B"}, "0x6", false, false));
    const Engine before(first);
    Engine assigned;
    assigned = first;
    const Engine::Node* const root = before.GetRoot();
    EXPECT_EQ(root, first.GetRoot());
    EXPECT_EQ(root, assigned.GetRoot());
    EXPECT_EQ(root, Engine(first).GetRoot());
    EXPECT_TRUE(assigned.DefineVariable("C", 1));
    first.Clear();
    EXPECT_TRUE(!first);
    EXPECT_EQ("(A|B)&(~A|~B)", Std(before.GetEquationAlt1(false)));
    EXPECT_EQ("0x3c", Std(assigned.GetEquationAsHexInitValue(false)));
    EXPECT_EQ("0x6", Std(before.GetEquationAsHexInitValue(false)));
}

TEST(OwedTree, IsForgottenWithTheEquation)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquationWithExplicitTerms({"A", "B"}, "0x6", false, false));
    const Engine copy(engine);
    engine.Clear();
    EXPECT_TRUE(!engine);
    EXPECT_EQ(0u, engine.Eval());
    EXPECT_EQ("", Std(engine.GetEquationAlt1(false)));
    EXPECT_EQ(nullptr, engine.GetRoot());
    EXPECT_EQ("TRUTH_TABLE(AND(LP(OR(A, B)), LP(OR(NOT(A), NOT(B)))))", TreeText(copy.GetRoot()));
    ASSERT_TRUE(engine.SetEquationWithExplicitTerms({"A", "B"}, "0x8", false, false));
    ASSERT_TRUE(engine.SetEquation("0x1"));
    EXPECT_EQ("(~A&~B)", Std(engine.GetEquationAlt1(false)));
    ASSERT_TRUE(engine.SetEquation("0x8"));
    ASSERT_TRUE(engine.SetEquation("A ^ B"));
    EXPECT_EQ("0x6", Std(engine.GetEquationAsHexInitValue(false)));
    EXPECT_TRUE(engine.IsExpression());
}

TEST(OwedTree, CountsAsNodesAndAsATree)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquationWithExplicitTerms({"A", "B"}, "0x6", false, false));
    engine.TokenizeNodes("C | D");
    engine.BuildTree();
    EXPECT_EQ("(A|B)&(~A|~B)", Std(engine.GetEquationAlt1(false)));
    EXPECT_EQ("A0 B0", VariablesOf(engine));
}

TEST(OwedTree, IsMadeSilentlyAndTracedAfterwards)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquationWithExplicitTerms({"A"}, "0b10", false, false));
    const Messages messages;
    const DebugMode debugMode;
    EXPECT_EQ("(A)", Std(engine.GetEquationAlt1(false)));
    EXPECT_EQ("", messages.Text()) << "the tree builder's trace belongs to the setting";
    EXPECT_EQ(0u, engine.Eval());
    EXPECT_NE("", messages.Text());
}

TEST(OwedTree, ComparesLikeATree)
{
    struct Value {
        std::vector<String> names;
        const char* text;
        bool termOrderFlag;
    };
    const Value values[] = {{{"A", "B"}, "0x8", false},       {{"A", "B"}, "0x8", true},
                            {{"B", "A"}, "0x8", false},       {{"A", "B"}, "0X8", false},
                            {{"A", "B"}, "0x4", false},       {{"A", "B"}, "0x4", true},
                            {{"A", "B"}, "0b100", false},     {{"A", "C"}, "0x4", false},
                            {{"A"}, "0b10", false},           {{"A"}, "0b10", true},
                            {{"A", "B"}, "0b100", true},      {{"B", "A"}, "0x4", true},
                            {{"'a'+A"}, "0b10", false},       {{}, "0b1", false},
                            {{"A", "B", "C"}, "0x90", false}, {{"A", "B", "C"}, "0x90", true}};
    for (const Value& left : values) {
        for (const Value& right : values) {
            Engine leftAtOnce;
            SetAtOnce(leftAtOnce, left.names, left.text, left.termOrderFlag);
            Engine rightAtOnce;
            SetAtOnce(rightAtOnce, right.names, right.text, right.termOrderFlag);
            const bool isEqual = leftAtOnce == rightAtOnce;
            for (int numMade = 0; numMade < 3; ++numMade) {
                Engine leftLater;
                leftLater.SetEquationWithExplicitTerms(left.names, left.text, left.termOrderFlag,
                                                       false);
                Engine rightLater;
                rightLater.SetEquationWithExplicitTerms(right.names, right.text,
                                                        right.termOrderFlag, false);
                if (numMade > 0)
                    leftLater.GetRoot();
                EXPECT_EQ(isEqual, leftLater == (numMade > 1 ? rightAtOnce : rightLater))
                    << left.text << " and " << right.text;
            }
        }
        Engine later;
        ASSERT_TRUE(
            later.SetEquationWithExplicitTerms(left.names, left.text, left.termOrderFlag, false));
        EXPECT_FALSE(later == Engine());
        Engine expression;
        ASSERT_TRUE(expression.SetEquation(later.GetEquationAlt1(false)));
        EXPECT_FALSE(later == expression);
        EXPECT_TRUE(later == Engine(later));
    }
}

TEST(OwedTree, MissingRowsFollowTheForm)
{
    // 2^7 and two more digits over 8 names: missing rows fill part of a word and a whole word.
    for (const bool isSum : {false, true}) {
        std::string text = "0b" + std::string(130, isSum ? '0' : '1');
        text[2] = isSum ? '1' : '0';
        Engine engine;
        ASSERT_TRUE(engine.SetEquationWithExplicitTerms(FirstNames(8), text.c_str(), false, false));
        EXPECT_EQ("0b" + std::string(126, isSum ? '0' : '1') + text.substr(2),
                  Std(engine.GetEquationAsBinaryInitValue()));
    }
}

} // namespace
