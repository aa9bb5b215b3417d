// A receiver of messages may do anything, even to the object that is being written, evaluated or
// built. What is being walked lives until the walk is over, and the debug switch takes effect from
// one message to the next.
#include <functional>
#include <memory>

#include <gtest/gtest.h>

#include "unit_support.h"

namespace {

// While it lives, calls 'act' for each message and counts messages.
class Receiver {
  public:
    explicit Receiver(std::function<void(size_t)> act)
        : m_act(std::move(act)),
          m_before(Port_MsgManData::setSink(
              [this](const char*, const char*, int, const char*, const char* text) {
                  m_text += text;
                  const size_t number = m_num_messages++;
                  m_act(number);
              }))
    {
    }
    ~Receiver() { Port_MsgManData::setSink(m_before); }
    Receiver(const Receiver&) = delete;
    Receiver& operator=(const Receiver&) = delete;

    size_t GetNumMessages() const { return m_num_messages; }
    const std::string& GetText() const { return m_text; }

  private:
    std::function<void(size_t)> m_act;
    std::string m_text;
    size_t m_num_messages = 0;
    Port_MsgManData::Sink m_before;
};

void SwitchOff(size_t)
{
    Engine::SetInternalDebugMode(false);
}

// What 'use' writes without interference.
std::string WrittenBy(const std::function<void()>& use)
{
    const DebugMode debugMode;
    const Receiver receiver([](size_t) {});
    use();
    return receiver.GetText();
}

TEST(Receiver, SwitchesTheTraceOfSettingOffAtItsFirstMessage)
{
    const DebugMode debugMode;
    const Receiver receiver(SwitchOff);
    Engine engine;
    EXPECT_TRUE(engine.SetEquation("A & B | C"));
    EXPECT_EQ(1u, receiver.GetNumMessages());
    EXPECT_EQ("OR(AND(A, B), C)", TreeText(engine.GetRoot()));
}

TEST(Receiver, SwitchesTheTraceOfEvaluationOffAtItsFirstMessage)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("~A | B"));
    const DebugMode debugMode;
    const Receiver receiver(SwitchOff);
    EXPECT_EQ(1u, engine.Eval());
    EXPECT_EQ(1u, receiver.GetNumMessages());
}

TEST(Receiver, SwitchesTheTraceOfATableOffAtItsFirstMessage)
{
    Engine engine;
    ASSERT_TRUE(engine.SetEquation("A & B"));
    const DebugMode debugMode;
    const Receiver receiver(SwitchOff);
    const Engine::TruthTable table = engine.GetTruthTable();
    EXPECT_EQ(1u, receiver.GetNumMessages());
    ASSERT_EQ(4u, table.GetRows().size());
    EXPECT_EQ(1u, table.GetRows()[3].GetResultValue());
}

// Ways to remove the equation during a walk.
void Set(std::unique_ptr<Engine>& engine)
{
    engine->SetEquation("Q ^ R");
}
void Clear(std::unique_ptr<Engine>& engine)
{
    engine->Clear();
}
void Destroy(std::unique_ptr<Engine>& engine)
{
    engine.reset();
}
typedef void (*Interfere)(std::unique_ptr<Engine>&);
const Interfere kAll[] = {Set, Clear, Destroy};

TEST(Receiver, TakesAwayTheEquationThatIsEvaluated)
{
    const auto make = [] {
        std::unique_ptr<Engine> engine(new Engine);
        engine->SetEquation("A & ~B | (C ^ D)");
        engine->SetVariable("C", 1);
        return engine;
    };
    std::unique_ptr<Engine> undisturbed = make();
    const std::string expected = WrittenBy([&] { undisturbed->Eval(); });
    for (const Interfere interfere : kAll) {
        std::unique_ptr<Engine> engine = make();
        const DebugMode debugMode;
        std::string inside;
        const Receiver receiver([&](size_t number) {
            if (number != 0)
                return;
            SwitchOff(0); // so that the following code writes no messages
            interfere(engine);
            Engine::SetInternalDebugMode(true);
        });
        EXPECT_EQ(1u, engine->Eval());
        EXPECT_EQ(expected, receiver.GetText());
    }
}

TEST(Receiver, TakesAwayTheEquationThatIsDumped)
{
    for (const char* text : {"A & ~B | (C ^ D)", "", "A ~ & B"}) {
        std::unique_ptr<Engine> undisturbed(new Engine);
        undisturbed->SetEquation(text);
        std::string expected;
        {
            const Receiver receiver([](size_t) {});
            undisturbed->Dbg();
            expected = receiver.GetText();
        }
        for (const Interfere interfere : kAll) {
            std::unique_ptr<Engine> engine(new Engine);
            engine->SetEquation(text);
            const Receiver receiver([&](size_t number) {
                if (number == 0)
                    interfere(engine);
            });
            engine->Dbg();
            EXPECT_EQ(expected, receiver.GetText()) << text;
        }
    }
}

TEST(Receiver, TakesAwayTheEquationThatIsBuilt)
{
    const std::string expected = WrittenBy([] { Engine().SetEquation("A & ~B | C"); });
    const std::string built = WrittenBy([] { Engine().SetEquation("Q ^ R"); });
    for (const size_t when : {0u, 5u, 9u}) {
        for (const Interfere interfere : kAll) {
            std::unique_ptr<Engine> engine(new Engine);
            const DebugMode debugMode;
            const Receiver receiver([&](size_t number) {
                if (number != when)
                    return;
                SwitchOff(0);
                interfere(engine);
                Engine::SetInternalDebugMode(true);
            });
            EXPECT_FALSE(engine->SetEquation("A & ~B | C"));
            EXPECT_EQ(expected, receiver.GetText());
            if (interfere == Set) { // what the receiver left is intact
                EXPECT_EQ("XOR(Q, R)", TreeText(engine->GetRoot()));
                EXPECT_EQ("Q0 R0", VariablesOf(*engine));
            } else if (interfere == Clear) {
                EXPECT_TRUE(!*engine);
                EXPECT_EQ("", VariablesOf(*engine));
            }
        }
    }
    EXPECT_NE(expected, built);
}

TEST(Receiver, TakesAwayTheEquationWhoseRefusedTextIsDumped)
{
    for (const bool isTraced : {false, true}) {
        for (const Interfere interfere : kAll) {
            std::unique_ptr<Engine> engine(new Engine);
            Engine::SetInternalDebugMode(isTraced);
            size_t numMessages = 0;
            const Receiver receiver([&](size_t) {
                Engine::SetInternalDebugMode(false);
                if (++numMessages == 1)
                    interfere(engine);
            });
            EXPECT_FALSE(engine->SetEquation("A & (B"));
            EXPECT_FALSE(engine && engine->SetEquation("A & & B"));
            EXPECT_FALSE(engine && engine->SetEquation("A &"));
        }
        Engine::SetInternalDebugMode(false);
    }
}

TEST(Receiver, TakesAwayTokensThatAreBuilt)
{
    for (const bool isRefused : {false, true}) {
        for (const Interfere interfere : kAll) {
            std::unique_ptr<Engine> engine(new Engine);
            engine->TokenizeNodes(isRefused ? "A & B C" : "A & B");
            const Engine shares(*engine);
            const DebugMode debugMode;
            const Receiver receiver([&](size_t number) {
                if (number != 0)
                    return;
                SwitchOff(0);
                interfere(engine);
                Engine::SetInternalDebugMode(true);
            });
            engine->BuildTree();
            EXPECT_NE(0u, receiver.GetNumMessages());
            SwitchOff(0);
            // The tokens are shared, so the other object has the tree too.
            EXPECT_EQ(isRefused ? "-" : "AND(A, B)", TreeText(shares.GetRoot()));
        }
    }
}

TEST(Receiver, CopiesTheEquationThatIsBuilt)
{
    Engine engine;
    std::vector<Engine> copies;
    copies.reserve(100);
    const DebugMode debugMode;
    {
        const Receiver receiver([&](size_t) { copies.push_back(engine); });
        EXPECT_TRUE(engine.SetEquation("A & B"));
    }
    SwitchOff(0);
    EXPECT_EQ("AND(A, B)", TreeText(engine.GetRoot()));
    ASSERT_FALSE(copies.empty());
    for (const Engine& copy : copies) {
        EXPECT_TRUE(!copy);
        EXPECT_EQ("", VariablesOf(copy));
    }
}

TEST(Receiver, ThrowsWhileTheEquationIsBuilt)
{
    struct Stop {};
    Engine engine;
    for (const size_t when : {0u, 1u, 7u}) {
        const DebugMode debugMode;
        const Receiver receiver([&](size_t number) {
            if (number == when)
                throw Stop();
        });
        EXPECT_THROW(engine.SetEquationWithExplicitTerms({"X", "Y"}, "A & ~B | C", false, false),
                     Stop);
        EXPECT_TRUE(!engine);
        EXPECT_EQ("", VariablesOf(engine));
    }
    EXPECT_TRUE(engine.SetEquation("A"));
}

TEST(Receiver, ChangesTheHandleTableAndRowThatAreDumped)
{
    Kq_BoolEquation equation("A & B");
    Kq_BoolEquation::Handle handle = equation.GetVariableHandle("B");
    Kq_BoolEquation::TruthTable table = equation.GetTruthTable();
    Kq_BoolEquation::TruthTable::Row row = table.GetRows()[3];
    const std::string handleText = WrittenBy([&] { handle.Dbg(); });
    const std::string tableText = WrittenBy([&] { table.Dbg(); });
    const std::string rowText = WrittenBy([&] { row.Dbg(); });
    {
        const Receiver receiver([&](size_t) { handle = Kq_BoolEquation::Handle(); });
        handle.Dbg();
        EXPECT_EQ(handleText, receiver.GetText());
    }
    {
        const Receiver receiver([&](size_t) { table = Kq_BoolEquation::TruthTable(); });
        table.Dbg();
        EXPECT_EQ(tableText, receiver.GetText());
    }
    {
        const Receiver receiver([&](size_t) {
            row = Kq_BoolEquation::TruthTable::Row(0, std::vector<unsigned int>());
        });
        row.Dbg();
        EXPECT_EQ(rowText, receiver.GetText());
    }
}

// The receiver of every message builds a copy of the same tokens: both builds end as they would
// alone.
TEST(Receiver, BuildsACopyOfTheTokensThatAreBuilt)
{
    for (const char* text : {"A & B", "A & B C"}) {
        const bool isRefused = Std(text).back() == 'C';
        Engine engine;
        engine.TokenizeNodes(text);
        Engine copy(engine);
        {
            const DebugMode debugMode;
            const Receiver receiver([&copy](size_t number) {
                if (number != 1)
                    return;
                SwitchOff(0);
                copy.BuildTree();
                Engine::SetInternalDebugMode(true);
            });
            engine.BuildTree();
        }
        for (Engine* built : {&engine, &copy}) {
            EXPECT_EQ(isRefused ? "-" : "AND(A, B)", TreeText(built->GetRoot()));
            built->TokenizeNodes("P"); // if the text was refused, the list is empty
            built->BuildTree();
            EXPECT_EQ(isRefused ? "P" : "AND(A, B)", TreeText(built->GetRoot()));
        }
    }
}

TEST(Receiver, BuildsACopyOfTheEquationThatIsBuilt)
{
    for (const char* text : {"X ^ Y", "X Y"}) {
        Engine engine;
        Engine copy;
        {
            const DebugMode debugMode;
            const Receiver receiver([&](size_t number) {
                if (number != 0)
                    return;
                SwitchOff(0);
                copy = engine;
                copy.TokenizeNodes(text);
                copy.BuildTree();
                Engine::SetInternalDebugMode(true);
            });
            EXPECT_TRUE(engine.SetEquationWithExplicitTerms({"B"}, "A & B", false, false));
        }
        EXPECT_EQ("AND(A, B)", TreeText(engine.GetRoot()));
        EXPECT_EQ("B0 A0", VariablesOf(engine));
        EXPECT_EQ(Std(text) == "X Y" ? "-" : "XOR(X, Y)", TreeText(copy.GetRoot()));
    }
}

TEST(Receiver, ChangesTheTableThatIsBuilt)
{
    Engine equation;
    ASSERT_TRUE(equation.SetEquation("A & B"));
    const Engine::TruthTable expected(equation);
    for (const char* text : {"", "C | D | E"}) {
        Engine other;
        other.SetEquation(text);
        Engine::TruthTable table;
        const DebugMode debugMode;
        const Receiver receiver([&](size_t number) {
            if (number != 3)
                return;
            SwitchOff(0);
            table = other;
            Engine::SetInternalDebugMode(true);
        });
        table = equation;
        EXPECT_EQ(2u, table.GetVariableNames().size());
        EXPECT_EQ(4u, table.GetRows().size());
        EXPECT_TRUE(table == expected);
    }
}

} // namespace
