// Equations used before and after 'main', by static objects of two sources that share nodes.
// usage: static_program on|off: the expected state of the debug switch. Prints "all is well".
#include <string>

#include <Kq_BoolEquationImp.h>
#include <port/Port_MsgManData.h>

#include "loading/static_equation.h"

namespace {

size_t s_numMessages = 0;

void UseAll(const char* when)
{
    Kq_BoolEquation copy(StaticEquation());
    Require(copy.GetTruthTable().GetRows().size() == 4, when);
    Require(std::string(copy.GetEquationAsHexInitValue(false).c_str()) == "0x4", when);
    copy.SetEquation((std::string("a_name_that_comes_up_") + when + " | 1").c_str());
    Require(copy.GetNumVariables() == 1 && copy.Eval() == 1, when);
}

struct User {
    User()
    {
        Port_MsgManData::setSink(
            [](const char*, const char*, int, const char*, const char*) { ++s_numMessages; });
        UseAll("before_main");
        m_equation = StaticEquation();
        m_is_debug_mode = Kq_BoolEquationImp::GetInternalDebugMode();
    }
    ~User()
    {
        UseAll("after_main");
        Require(m_equation == StaticEquation(), "sharing after main");
        Port_MsgManData::setSink(Port_MsgManData::Sink());
    }
    Kq_BoolEquation m_equation;
    bool m_is_debug_mode;
};
User s_user;

} // namespace

int main(int argc, char** argv)
{
    const bool isOn = argc == 2 && std::string(argv[1]) == "on";
    Require(s_user.m_is_debug_mode == isOn, "the debug switch before main");
    Require((s_numMessages != 0) == isOn, "the trace before main");
    UseAll("in_main");
    StaticEquation().SetVariable("B", 1);
    return 0;
}
