// A plug-in that a host program loads at run time. It brings the library with it, and has an
// equation as a static object, made while the plug-in is loaded and destroyed while it is unloaded.
#include <string>

#include <Kq_BoolEquation.h>
#include <Kq_BoolEquationImp.h>

namespace {

const Kq_BoolEquation s_early("a_static_equation_with_a_long_name & ~B");

} // namespace

// Whether everything works; names differ from round to round, so that the pool of names grows.
extern "C" KQ_EXPORT bool KqTestUse(int round)
{
    const std::string name = "a_long_name_of_round_number_" + std::to_string(round);
    Kq_BoolEquation equation((name + " & ~B | C").c_str());
    equation.SetVariable("C", 1);
    Kq_BoolEquation copy(equation);
    const Kq_BoolEquation::TruthTable table = copy.GetTruthTable();
    const Kq_BoolEquation::Handle handle = copy.GetVariableHandle(name.c_str());
    copy.SetEquation("0x96");
    Kq_BoolEquation refused("A B");
    return equation.Eval() == 1 && table.GetRows().size() == 8 && handle.size() == 2 &&
           copy.IsHexInitValue() && !refused && s_early.GetNumVariables() == 2 &&
           std::string(s_early.GetEquationAsHexInitValue(false).c_str()) == "0x4";
}

extern "C" KQ_EXPORT bool KqTestDebugMode()
{
    return Kq_BoolEquationImp::GetInternalDebugMode();
}
