// Every exported member with its first, second, third ... allocation failing until it succeeds,
// both of the global operator new (which serves the class allocators too) and of the host's raw
// memory. After each failure: only std::bad_alloc came out; the objects answer, take new values and
// are destroyed; objects that share with them are unchanged; nothing is leaked; the pool of names
// works.
#include <cstdio>
#include <memory>
#include <new>

#include <gtest/gtest.h>

#include "random/failing_memory.h"
#include "random/operations.h"

namespace {

using operations::Objects;
using operations::Operation;

// What can be seen of an equation.
std::string View(const Engine& engine)
{
    return Std(engine.GetEquation(true)) + " " + TreeText(engine.GetRoot()) + " " +
           VariablesOf(engine) + " " + Std(engine.GetEquationAsHexInitValue(false)) + " " +
           std::to_string(engine.Eval());
}

// Asks everything, whatever state the objects are in; then gives them new values.
void UseEquation(Kq_BoolEquation& equation, const char* newName)
{
    equation.Eval();
    equation.GetEquation(true);
    equation.GetVariableHandle("B");
    // A failure may leave variables; tabulating many of them would not test safety.
    if (equation.GetNumVariables() <= 8) {
        equation.GetEquationAsBinaryInitValue();
        EXPECT_EQ(equation.GetTruthTable().GetRows().size(),
                  !equation || equation.GetNumVariables() == 0 ? 0u
                                                               : 1u << equation.GetNumVariables());
    }
    const Kq_BoolEquation copy(equation);
    EXPECT_TRUE(copy == equation);
    EXPECT_EQ(VariablesOf(copy), VariablesOf(equation));
    // The pool of names, with one name that it has and one that may be new.
    const std::string text = std::string("a_name_that_needs_memory & ~") + newName;
    ASSERT_TRUE(equation.SetEquation(text.c_str()));
    EXPECT_EQ(std::string("a_name_that_needs_memory0 ") + newName + "0", VariablesOf(equation));
    EXPECT_EQ("0x4", Std(equation.GetEquationAsHexInitValue(false)));
    equation.Clear();
    EXPECT_EQ("", VariablesOf(equation));
}

void Use(Objects& o)
{
    UseEquation(o.a, "C");
    UseEquation(o.b, "quite_a_long_name_for_a_net");
    o.table.GetRows();
    o.table = Kq_BoolEquation("A");
    EXPECT_EQ(2u, o.table.GetRows().size());
    o.row = o.table.GetRows().at(1);
    EXPECT_EQ(1u, o.row.GetResultValue());
    const Kq_BoolEquation::Handle handle(o.handle);
    EXPECT_TRUE(handle == o.handle);
    o.handle = Kq_BoolEquation("A | B").GetVariableHandle("B");
    EXPECT_EQ(2u, o.handle.size());

    EXPECT_TRUE(Engine(o.engine) == o.engine);
    o.engine.SetEquation("A ^ B");
    EXPECT_EQ("A ^ B XOR(A, B) A0 B0 0x6 0", View(o.engine));
    o.other = o.engine;
    EXPECT_EQ(View(o.engine), View(o.other));
    o.engineTable = o.engine;
    EXPECT_EQ(4u, o.engineTable.GetRows().size());
    o.engineRow = o.engineTable.GetRows().at(2);
    EXPECT_EQ(1u, o.engineRow.GetResultValue());
    o.node = Node(Node::ID, "A");
    EXPECT_EQ("A", Std(o.node.GetToken()));
    for (const char* name : {"another", "another_variable_whose_name_is_not_the_same", "x"}) {
        EXPECT_EQ(name, Std(o.pool.find(name)));
        EXPECT_EQ(&o.pool.find(name), &o.pool.find(name));
    }
}

// One life of the objects; false once nothing failed.
bool FailAt(const Operation& operation, size_t failing, bool debugMode)
{
    const Messages messages;
    bool hasFailed = false;
    std::unique_ptr<Objects> objects(new Objects);
    // These share the nodes with the objects: with too low a count the nodes would be freed too
    // early, with too high a count never.
    const Kq_BoolEquation witness(objects->a);
    const Engine engineWitness(objects->engine);
    const std::string before = View(engineWitness);
    Engine::SetInternalDebugMode(debugMode);
    try {
        const memory::FailingAllocation armed(failing);
        operation.run(*objects);
    } catch (const std::bad_alloc&) {
        hasFailed = true;
    }
    Engine::SetInternalDebugMode(false);
    EXPECT_EQ(before, View(engineWitness)) << operation.name;
    EXPECT_EQ(before, View(*witness.GetImp())) << operation.name;
    Use(*objects);
    objects.reset();
    EXPECT_EQ(before, View(engineWitness)) << operation.name;
    EXPECT_EQ(before, View(*witness.GetImp())) << operation.name;
    return hasFailed;
}

// How often the operation failed before it succeeded. In debug mode there may be thousands of
// messages, each with an allocation: then, after the 200th, one in sixteen fails.
size_t FailEach(const Operation& operation, bool debugMode)
{
    size_t numFailures = 0;
    for (size_t failing = 0; FailAt(operation, failing, debugMode); ++numFailures)
        failing += debugMode && failing >= 200 ? failing / 16 : 1;
    return numFailures;
}

void ExpectSafe(const std::vector<Operation>& operations)
{
    for (const Operation& operation : operations) {
        for (const bool debugMode : {false, true}) {
            // The first round fills what the process keeps: names and spellings.
            FailEach(operation, debugMode);
            const size_t numLive = memory::NumLive();
            const size_t numFailures = FailEach(operation, debugMode);
            EXPECT_EQ(numLive, memory::NumLive()) << operation.name << " leaks";
            std::printf("%4zu failures%s: %s\n", numFailures, debugMode ? ", traced" : "",
                        operation.name);
        }
    }
}

TEST(Operations, OfTheEquationAreSafeWhateverFails)
{
    ExpectSafe(operations::kOfEquation);
}

TEST(Operations, OfTablesAndHandlesAreSafeWhateverFails)
{
    ExpectSafe(operations::kOfTables);
}

TEST(Operations, OfTheEngineAreSafeWhateverFails)
{
    ExpectSafe(operations::kOfEngine);
}

TEST(Operations, OfEngineTablesNodesAndNamesAreSafeWhateverFails)
{
    ExpectSafe(operations::kOfEngineTables);
}

TEST(Operations, OtherSizesThanTheClassesOwnComeFromTheHost)
{
    const size_t numRaw = memory::NumRawAllocations();
    Engine::operator delete(Engine::operator new(sizeof(Engine)), sizeof(Engine));
    Node::operator delete(Node::operator new(sizeof(Node)), sizeof(Node));
    EXPECT_EQ(numRaw, memory::NumRawAllocations());
    Engine::operator delete(Engine::operator new(sizeof(Engine) + 1), sizeof(Engine) + 1);
    EXPECT_EQ(numRaw + 1, memory::NumRawAllocations());
    Node::operator delete(Node::operator new(sizeof(Node) + 1), sizeof(Node) + 1);
    EXPECT_EQ(numRaw + 2, memory::NumRawAllocations());
    const memory::FailingAllocation armed(0);
    EXPECT_THROW(Node::operator new(sizeof(Node) + 1), std::bad_alloc);
}

TEST(Operations, FailingMemoryIsNoticed)
{
    // The helpers above must detect what they look for.
    const size_t numLive = memory::NumLive();
    void* leak = ::operator new(1);
    EXPECT_EQ(numLive + 1, memory::NumLive());
    ::operator delete(leak);
    EXPECT_EQ(numLive, memory::NumLive());
    const Operation allocate = {"one allocation",
                                [](Objects&) { ::operator delete(::operator new(1)); }};
    EXPECT_TRUE(FailAt(allocate, 0, false));
    EXPECT_FALSE(FailAt(allocate, 1, false));
}

} // namespace
