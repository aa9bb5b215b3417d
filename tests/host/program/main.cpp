// A program for the tiny host: exits with 1 if a result, or a byte of the messages, is wrong.
// Requires: TINY_MESSAGES names a file to write; TINY_MAV_KQ_BOOL_EQUATION_DEBUG is set.
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <sstream>
#include <string>
#include <type_traits>

#include <Kq_BoolEquation.h>
#include <Kq_BoolEquationImp.h>
#include <port/Port_Init.h>
#include <port/mav_malloc.h>

typedef Port::StringBase<char> String;

// The tiny host's string cannot be moved and does not hold a standard string.
static_assert(!std::is_nothrow_move_constructible<String>::value, "not the tiny host's string");

static int s_numWrong = 0;

static void Expect(const char* what, const std::string& expected, const std::string& actual)
{
    if (expected == actual)
        return;
    std::printf("%s: expected '%s', got '%s'\n", what, expected.c_str(), actual.c_str());
    ++s_numWrong;
}

static std::string ReadMessages()
{
    std::ifstream file(std::getenv("TINY_MESSAGES"), std::ios::binary);
    std::ostringstream text;
    text << file.rdbuf();
    return text.str();
}

static void CheckRoad()
{
    Kq_BoolEquation equation("A & ~B");
    Expect("as typed", "A&~B", equation.GetEquation(false).c_str());
    Expect("syntax 1", "A & ~ B", equation.GetEquationAlt1(true).c_str());
    Expect("syntax 2", "A*~B", equation.GetEquationAlt2(false).c_str());
    Expect("syntax 3", "A .AND. ~ B", equation.GetEquationAlt3(true).c_str());
    Expect("hexadecimal", "0x4", equation.GetEquationAsHexInitValue(false).c_str());
    Expect("binary", "0b0100", equation.GetEquationAsBinaryInitValue().c_str());

    equation.SetVariable("A", 1);
    Expect("value", "1", std::to_string(equation.Eval()));

    const Kq_BoolEquation copy(equation);
    Expect("init value accepted", "1", std::to_string(equation.SetEquation("0x4")));
    Expect("init value as expression", "(A*~B)", equation.GetEquationAlt2(false).c_str());
    Expect("the copy", "A&~B", copy.GetEquation(false).c_str());

    const std::string name(100000, 'n');
    Expect("long name", "1", std::to_string(equation.SetEquation((name + "|x").c_str())));
    Expect("long name back", name + "|x", equation.GetEquation(false).c_str());
}

static void CheckMessages()
{
    Kq_BoolEquationImp::SetInternalDebugMode(false);
    Kq_BoolEquation equation("A & ~B");
    const std::string before = ReadMessages();
    equation.GetVariableHandle("B").Dbg();
    equation.GetTruthTable().GetRows()[2].Dbg();

    const std::string facade = "[Kq ../s/Kq_BoolEquation.cpp $Revision: 1.10 $]";
    const std::string engine = "[Kq ../s/Kq_BoolEquationImp.cpp $Revision: 1.35 $]";
    Expect("messages",
           facade + "Kq_BoolEquation::Handle::Dbg" + facade + "Size = 2\n" + facade +
               "Entry[0] = 1\n" + facade + "Entry[1] = 3\n" + engine + "    Row: 1=" + engine +
               "1" + engine + "0" + engine + "\n",
           ReadMessages().substr(before.size()));
}

static void CheckServices()
{
    Expect("services", "5", std::to_string(tiny_services()));
    Expect("debug mode", "1", std::to_string(Kq_BoolEquationImp::GetInternalDebugMode()));

    // The host serves sizes that are not the engine's.
    const int numBlocks = tiny_live_blocks();
    void* memory = Kq_BoolEquationImp::operator new(1);
    Expect("blocks", std::to_string(numBlocks + 1), std::to_string(tiny_live_blocks()));
    Kq_BoolEquationImp::operator delete(memory, 1);
    Expect("blocks given back", std::to_string(numBlocks), std::to_string(tiny_live_blocks()));
}

int main()
{
    CheckServices();
    CheckRoad();
    CheckMessages();
    std::printf("%d wrong\n", s_numWrong);
    return s_numWrong ? 1 : 0;
}
