// The n-th allocation fails, for every n until an operation succeeds: only std::bad_alloc comes
// out, every object is still safe to use, assign and destroy, and nothing is leaked. This file has
// special situations and promises; operations_test.cpp goes through every exported member.
#include <cstdio>
#include <functional>
#include <new>

#include <gtest/gtest.h>

#include "random/failing_memory.h"
#include "unit/unit_support.h"

namespace {

using memory::FailingAllocation;

struct Objects {
    Kq_BoolEquation a;
    Kq_BoolEquation b;
    Kq_BoolEquation::TruthTable table;
    Kq_BoolEquation::Handle handle;
};

typedef std::function<void(Objects&)> Operation;

// Two equations that share their nodes, a table and a handle.
void Prepare(Objects& objects)
{
    objects.a.SetEquation("a_name_that_needs_memory & ~(B | C) ^ 1");
    objects.b = objects.a;
    objects.table = Kq_BoolEquation("X | Y");
    objects.handle = objects.a.GetVariableHandle("B");
}

// Asks everything that must answer, whatever happened before.
void Use(Objects& objects)
{
    for (Kq_BoolEquation* equation : {&objects.a, &objects.b}) {
        equation->Eval();
        equation->GetEquation(true);
        equation->GetEquationAlt2(false);
        equation->GetVariable("B");
        // A failure may leave variables; tabulating many of them would not test safety.
        if (equation->GetNumVariables() <= 6) {
            equation->GetEquationAsHexInitValue(false);
            equation->GetTruthTable().GetRows();
        }
        Kq_BoolEquation copy(*equation);
        EXPECT_TRUE(copy == *equation);
        *equation = objects.b;
        equation->SetEquation("A & B");
        EXPECT_EQ("0x8", Std(equation->GetEquationAsHexInitValue(false)));
        equation->Clear();
    }
    objects.table.GetRows();
    objects.table = Kq_BoolEquation("A");
    EXPECT_EQ(2u, objects.table.GetRows().size());
}

// How often the operation failed before it succeeded. In debug mode a host may allocate for each of
// many thousand messages: then each of the first 256 allocations fails, after that one in sixteen.
size_t FailEach(const Operation& operation, bool debugMode)
{
    for (size_t failing = 0;; failing += debugMode && failing >= 256 ? failing / 16 : 1) {
        const Messages messages;
        bool hasFailed = false;
        Objects objects;
        Prepare(objects);
        Kq_BoolEquationImp::SetInternalDebugMode(debugMode);
        try {
            const FailingAllocation armed(failing);
            operation(objects);
        } catch (const std::bad_alloc&) {
            hasFailed = true;
        }
        Kq_BoolEquationImp::SetInternalDebugMode(false);
        Use(objects);
        if (!hasFailed)
            return failing;
    }
}

void ExpectSafe(const char* name, const Operation& operation)
{
    for (const bool debugMode : {false, true}) {
        // The first round fills what the process keeps: names and spellings.
        FailEach(operation, debugMode);
        const size_t numLive = memory::NumLive();
        const size_t numFailures = FailEach(operation, debugMode);
        EXPECT_EQ(numLive, memory::NumLive()) << name << " leaks";
        std::printf("%-28s %4zu failures%s\n", name, numFailures, debugMode ? ", traced" : "");
    }
}

TEST(Allocation, SettingIsSafeWhateverFails)
{
    ExpectSafe("expression", [](Objects& o) {
        o.a.SetEquation("(P | Q ~ & R) ^ ~quite_a_long_name_for_a_net & P");
    });
    ExpectSafe("refused by the tokenizer", [](Objects& o) { o.a.SetEquation("P | Q $"); });
    ExpectSafe("refused by the builder", [](Objects& o) { o.a.SetEquation("P | Q R S T"); });
    ExpectSafe("negated operator refused",
               [](Objects& o) { o.a.SetEquation("(P ~ & Q) & R ~ | S & ~ | T"); });
    ExpectSafe("init value", [](Objects& o) { o.a.SetEquation("0x96"); });
    ExpectSafe("init value refused", [](Objects& o) { o.a.SetEquation("0x9"); });
    ExpectSafe("terms", [](Objects& o) {
        o.a.SetEquationWithExplicitTerms({"A", "B", "a_listed_input_with_a_long_name"}, "A & D",
                                         false, false);
    });
    ExpectSafe("terms with an init value", [](Objects& o) {
        o.a.SetEquationWithExplicitTerms({"A", "B"}, "0x6", false, true);
    });
    ExpectSafe("many names", [](Objects& o) {
        o.a.SetEquation("a+b+c+d+e+f+g+h+i+j+k+l+m+n+o+p+q+r+s+t+u+v+w+x+y+z+a1+b1+c1+d1");
    });
    // Walks keep a few nodes without the heap; this text needs more.
    ExpectSafe("long chain", [](Objects& o) {
        std::string chain = "P";
        for (unsigned int count = 0; count < 150; ++count)
            chain += "&P";
        Kq_BoolEquationImp::SetInternalDebugMode(false); // the size of traces is quadratic
        o.a.SetEquation(chain.c_str());
    });
    ExpectSafe("own name", [](Objects& o) { o.a.SetEquation(o.a.GetVariables()[0].first); });
}

TEST(Allocation, CopyingIsSafeWhateverFails)
{
    ExpectSafe("copy", [](Objects& o) { Kq_BoolEquation copy(o.a); });
    ExpectSafe("construct", [](Objects&) { Kq_BoolEquation made("P & Q"); });
    ExpectSafe("clear shared", [](Objects& o) { o.a.Clear(); });
    ExpectSafe("assign table", [](Objects& o) {
        Kq_BoolEquation::TruthTable table(o.a);
        table = o.table;
        o.table = table;
    });
}

TEST(Allocation, FailedSettingLeavesAWholeEquationOrNone)
{
    for (size_t failing = 0;; ++failing) {
        Kq_BoolEquation equation("A & B");
        bool hasFailed = false;
        try {
            const FailingAllocation armed(failing);
            equation.SetEquation("a_name_that_needs_memory & ~another_name_that_needs_memory");
        } catch (const std::bad_alloc&) {
            hasFailed = true;
        }
        if (!hasFailed)
            break;
        const std::string text = Std(equation.GetEquation(false));
        EXPECT_EQ(text.empty() ? "" : "A&B", text);
        EXPECT_EQ(text.empty() ? 0u : 2u, equation.GetNumVariables());
    }
}

TEST(Allocation, FailedAssignmentChangesNothing)
{
    for (size_t failing = 0;; ++failing) {
        Kq_BoolEquation a("A & B");
        const Kq_BoolEquation b("a_name_that_needs_memory | another_name_that_needs_memory");
        try {
            const FailingAllocation armed(failing);
            a = b;
            break;
        } catch (const std::bad_alloc&) {
        }
        EXPECT_EQ("A&B", Std(a.GetEquation(false)));
        EXPECT_EQ("A0 B0", VariablesOf(a));
    }
}

TEST(Allocation, AskingIsSafeWhateverFails)
{
    ExpectSafe("define",
               [](Objects& o) { o.a.DefineVariable("another_variable_of_some_length", 1); });
    ExpectSafe("handle", [](Objects& o) { o.handle = o.a.GetVariableHandle("C"); });
    ExpectSafe("render", [](Objects& o) { o.a.GetEquationAlt3(true); });
    ExpectSafe("eval", [](Objects& o) { o.a.Eval(); });
    ExpectSafe("hexadecimal", [](Objects& o) { o.a.GetEquationAsHexInitValue(true); });
    ExpectSafe("binary", [](Objects& o) { o.a.GetEquationAsBinaryInitValue(); });
    ExpectSafe("term equation", [](Objects& o) { o.a.GetInitValueTermEquation(); });
    ExpectSafe("table", [](Objects& o) { o.table = o.a; });
    ExpectSafe("rows", [](Objects& o) { o.table.GetRows(); });
    ExpectSafe("names", [](Objects& o) { o.table.GetVariableNames(); });
    ExpectSafe("dump", [](Objects& o) { o.a.Dbg(); });
}

// Uses new names, tokens, an owed tree and a handle.
void UseEquations()
{
    static size_t s_number = 0;
    std::string text;
    for (size_t count = 0; count < 20; ++count)
        text += "(served_" + std::to_string(s_number++) + ")&";
    Engine engine;
    EXPECT_TRUE(engine.SetEquation((text + "A").c_str()));
    engine.Clear();
    engine.TokenizeNodes("A | B");
    engine.BuildTree();
    engine.DefineVariable("B", 1);
    EXPECT_EQ(2u, engine.GetVariableHandle("B").size());
    EXPECT_TRUE(engine.SetEquation("0b10"));
    EXPECT_NE(nullptr, engine.GetRoot());
}

// No lock is held while memory is allocated or freed.
TEST(Allocation, WhoeverServesMemoryMayUseEquations)
{
    const Messages messages;
    std::string text = "A";
    for (size_t count = 0; count < 2000; ++count)
        text += "&name_" + std::to_string(count);
    const memory::UsingMemory served(UseEquations);
    Engine engine;
    EXPECT_TRUE(engine.SetEquation(text.c_str()));
    EXPECT_EQ(2001u, engine.GetNumVariables());
    engine.Clear();
    engine.TokenizeNodes("A & B & A");
    Engine copy(engine);
    copy.DefineVariable("A", 1);
    EXPECT_EQ(3u, copy.GetVariableHandle("A").size());
    copy.Dbg();
    copy.BuildTree();
    EXPECT_EQ("AND(AND(A, B), A)", TreeText(engine.GetRoot()));
    EXPECT_TRUE(engine.SetEquationWithExplicitTerms({"A", "B"}, "0x6", false, false));
    EXPECT_EQ("(A|B)&(~A|~B)", Std(engine.GetEquationAsExpression(false)));
}

TEST(Allocation, PoolOfNamesStaysWhole)
{
    const char* names[] = {"abcdefghijklmnopqrstuvwxyz", "abcdefghijklmnop",
                           "abcdefghijklmnopqrstuvwxyz0", "abd", "b"};
    for (size_t failing = 0;; ++failing) {
        bool hasFailed = false;
        Engine::StringMgr pool;
        for (const char* name : names) {
            try {
                const FailingAllocation armed(failing);
                pool.find(name);
            } catch (const std::bad_alloc&) {
                hasFailed = true;
            }
        }
        for (const char* name : names) {
            EXPECT_EQ(name, Std(pool.find(name)));
            EXPECT_EQ(&pool.find(name), &pool.find(name));
        }
        if (!hasFailed)
            break;
    }
}

// How many allocations 'operation' takes.
template <class Counted>
size_t CountAllocations(Counted operation)
{
    const size_t before = memory::NumAllocations();
    operation();
    return memory::NumAllocations() - before;
}

TEST(Allocation, SmallEquationsNeedFew)
{
#ifndef NDEBUG
    GTEST_SKIP() << "the internal checks of this build allocate";
#endif
    const String text = "(A & B) | (C ^ ~D) & E";
    const std::vector<String> inputs = {"A", "B", "C", "D", "E", "F"};
    Kq_BoolEquation first(text); // fills the pool of names
    // The engine, its store, the list of nodes, the nodes, the variables.
    EXPECT_EQ(5u, CountAllocations([&] { Kq_BoolEquation equation(text); }));
    Kq_BoolEquation equation(text);
    EXPECT_GE(1u, CountAllocations([&] { equation.SetEquation(text); })) << "the nodes";
    EXPECT_EQ(0u, CountAllocations([&] { equation.Eval(); }));
    EXPECT_EQ(0u, CountAllocations([&] { equation.SetVariable("B", 1); }));
    const Kq_BoolEquation::Handle handle = equation.GetVariableHandle("C");
    EXPECT_EQ(0u, CountAllocations([&] { equation.SetVariable(handle, 1); }));
    EXPECT_EQ(0u, CountAllocations([&] { equation.GetVariable(handle); }));
    EXPECT_EQ(0u, CountAllocations([&] { equation.Eval(); }));
    EXPECT_EQ(0u, CountAllocations([&] { equation.GetEquationAsHexInitValue(false); }));
    equation.SetEquationWithExplicitTerms(inputs, text, false, false);
    EXPECT_EQ(1u, CountAllocations([&] { equation.GetEquationAsHexInitValue(false); }))
        << "the text";
    EXPECT_EQ(2u, CountAllocations([&] { Kq_BoolEquation copy(equation); })) << "engine, variables";
}

TEST(Allocation, EvaluationOfOrdinaryDepthsNeedsNone)
{
    std::string text = "v0";
    for (int number = 1; number < 30; ++number)
        text = "(" + text + (number % 2 != 0 ? " & v" : " ^ v") + std::to_string(number) + ")";
    Kq_BoolEquation equation(text.c_str());
    EXPECT_EQ(0u, CountAllocations([&] { equation.Eval(); })) << "node by node";
    equation.Eval(); // compiles
    EXPECT_EQ(0u, CountAllocations([&] { equation.Eval(); })) << "the compiled program";
}

struct Thrown {};

TEST(Allocation, AThrowingSinkIsTreatedTheSame)
{
    for (const char* text : {"A & ~(B ~ | C)", "A B C", "A & ~ | B"}) {
        for (size_t failing = 0;; ++failing) {
            bool hasFailed = false;
            Objects objects;
            Prepare(objects);
            size_t numLeft = failing;
            const Port_MsgManData::Sink before = Port_MsgManData::setSink(
                [&](const char*, const char*, int, const char*, const char*) {
                    if (numLeft-- == 0)
                        throw Thrown();
                });
            Kq_BoolEquationImp::SetInternalDebugMode(true);
            try {
                objects.a.SetEquation(text);
                objects.a.Eval();
                objects.a.GetTruthTable().Dbg();
            } catch (const Thrown&) {
                hasFailed = true;
            }
            Kq_BoolEquationImp::SetInternalDebugMode(false);
            Port_MsgManData::setSink(before);
            Use(objects);
            if (!hasFailed)
                break;
        }
    }
}

// An init value's tree is made on demand.
TEST(Allocation, TreeThatIsOwedIsOwedStillAfterAFailure)
{
    const std::string expected = "(a_name_that_needs_memory|B)&(~a_name_that_needs_memory|~B)";
    Kq_BoolEquationImp warm;
    warm.SetEquationWithExplicitTerms({"a_name_that_needs_memory", "B"}, "0x6", false, false);
    EXPECT_EQ(expected, Std(warm.GetEquationAlt1(false)));
    warm.Clear();
    const size_t numLive = memory::NumLive();
    size_t numFailures = 0;
    for (size_t failing = 0;; ++failing) {
        Kq_BoolEquationImp equation;
        ASSERT_TRUE(equation.SetEquationWithExplicitTerms({"a_name_that_needs_memory", "B"}, "0x6",
                                                          false, false));
        Kq_BoolEquationImp copy(equation);
        bool hasFailed = false;
        try {
            const FailingAllocation armed(failing);
            equation.GetRoot();
        } catch (const std::bad_alloc&) {
            hasFailed = true;
        }
        if (!hasFailed)
            break;
        ++numFailures;
        // Everything is as before, also for copies and assignments.
        EXPECT_FALSE(!equation);
        EXPECT_EQ("0x6", Std(equation.GetEquationAsHexInitValue(false)));
        EXPECT_EQ(0u, copy.Eval());
        EXPECT_EQ("0x6", Std(copy.GetEquation(false)));
        if (failing % 2 == 0)
            equation = Kq_BoolEquationImp();
        EXPECT_EQ(expected, Std(copy.GetEquationAlt1(false)));
        EXPECT_EQ(copy.GetRoot(), Kq_BoolEquationImp(copy).GetRoot());
        copy.Clear();
        EXPECT_EQ(failing % 2 == 0 ? "" : expected, Std(equation.GetEquationAlt1(false)));
    }
    EXPECT_EQ(numLive, memory::NumLive());
    EXPECT_LT(3u, numFailures) << "the list, the block, and long texts in nodes";
}

TEST(Allocation, InitValueAnswersWithoutNodes)
{
    std::vector<String> names;
    for (const char* name : {"A", "B", "C", "D", "E", "F"})
        names.push_back(name);
    Kq_BoolEquationImp equation;
    ASSERT_TRUE(equation.SetEquationWithExplicitTerms(names, "0x123456789abcdef0", true, false));
    const Kq_BoolEquationImp copy(equation);
    equation.DefineVariable("G", 1);
    equation.Eval();
    equation.GetEquation(true);
    equation.GetEquationAsHexInitValue(true);
    equation.GetEquationAsBinaryInitValue();
    equation.GetTruthTable();
    EXPECT_EQ(33u, equation.GetVariableHandle("F").size());
    EXPECT_FALSE(equation.IsExpression());
    EXPECT_FALSE(copy == Kq_BoolEquationImp());
    Kq_BoolEquationImp other;
    other.SetEquationWithExplicitTerms(names, "0x123456789abcdef0", false, false);
    EXPECT_FALSE(copy == other) << "the bits count from the other end";
    EXPECT_EQ(1u, equation.GetVariableHandle("G").size());
    std::vector<uint64_t> words;
    EXPECT_TRUE(equation.GetColumn(words));
    // Making the nodes takes memory, so there were none yet; once they exist, no more memory is
    // taken.
    const size_t numBefore = memory::NumAllocations();
    ASSERT_NE(nullptr, copy.GetRoot());
    EXPECT_LT(numBefore, memory::NumAllocations());
    const size_t numAfter = memory::NumAllocations();
    ASSERT_NE(nullptr, equation.GetRoot());
    EXPECT_EQ(numAfter, memory::NumAllocations());
}

} // namespace
