// A program outside the build that uses the installed library; exits with 1 if a result is wrong.
#include <cstdio>
#include <string>

#include <Kq_BoolEquation.h>
#include <Kq_BoolEquationImpNode.h>
#include <port/Port_MsgManData.h>

static int s_numWrong = 0;

static void Expect(const char* what, const std::string& expected, const std::string& actual)
{
    if (expected == actual)
        return;
    std::printf("%s: expected '%s', got '%s'\n", what, expected.c_str(), actual.c_str());
    ++s_numWrong;
}

int main()
{
    Kq_BoolEquation equation("A & ~B");
    Expect("hexadecimal", "0x4", equation.GetEquationAsHexInitValue(false).c_str());
    Expect("syntax 3", "A .AND. ~ B", equation.GetEquationAlt3(true).c_str());
    Expect("terms", "B+A", equation.GetInitValueTermEquation().c_str());

    equation.SetVariable("A", 1);
    Expect("value", "1", std::to_string(equation.Eval()));
    Expect("rows", "4", std::to_string(equation.GetTruthTable().GetRows().size()));

    const Kq_BoolEquationImp* engine = equation.GetImp();
    Expect("root", "AND", engine->GetRoot()->GetTypeName().c_str());

    equation.SetEquationWithExplicitTerms({"A", "B", "D"}, "0x30", false, false);
    Expect("explicit terms", "3", std::to_string(equation.GetNumVariables()));
    Expect("expression", "(A*~B*~D)+(A*~B*D)", equation.GetEquationAlt2(false).c_str());

    std::string dump;
    Port_MsgManData::setSink(
        [&dump](const char*, const char*, int, const char*, const char* text) { dump += text; });
    equation.GetVariableHandle("none").Dbg();
    Expect("dump", "Kq_BoolEquation::Handle::DbgSize = 0\n", dump);

    Expect("refused", "0", std::to_string(equation.SetEquation("A &")));
    std::printf("%d wrong\n", s_numWrong);
    return s_numWrong ? 1 : 0;
}
