// tests/random/check_operations.py compares the names here with the symbols of the library.
#include "threads/telling.h"

namespace threads {

namespace {

// Members that facade and engine have in common.

template <class Equation>
std::string HexInitValue(Objects o, size_t at)
{
    return Tell(At<Equation>(o, at).GetEquationAsHexInitValue(true));
}
template <class Equation>
std::string BinaryInitValue(Objects o, size_t at)
{
    return Tell(At<Equation>(o, at).GetEquationAsBinaryInitValue());
}
template <class Equation>
std::string TermEquation(Objects o, size_t at)
{
    return Tell(At<Equation>(o, at).GetInitValueTermEquation());
}
template <class Equation, String (Equation::*render)(bool) const>
std::string Rendered(Objects o, size_t at)
{
    return Tell((At<Equation>(o, at).*render)(false)) + "\n" +
           Tell((At<Equation>(o, at).*render)(true));
}
template <class Equation, bool (Equation::*is)() const>
std::string Is(Objects o, size_t at)
{
    return Tell((At<Equation>(o, at).*is)());
}
template <class Equation>
std::string Column(Objects o, size_t at)
{
    std::vector<uint64_t> words;
    const bool hasColumn = At<Equation>(o, at).GetColumn(words);
    return Tell(hasColumn, words);
}
template <class Equation>
std::string WatchedColumn(Objects o, size_t at)
{
    std::vector<uint64_t> words;
    const auto goOn = [](void* context) { return ++*static_cast<size_t*>(context) > 0; };
    size_t numAsked = 0;
    const bool hasColumn = At<Equation>(o, at).GetColumn(words, goOn, &numAsked);
    return Tell(hasColumn, words);
}
template <class Equation>
std::string Evaluated(Objects o, size_t at)
{
    return Tell(At<Equation>(o, at).Eval()) + Tell(Twin<Equation>(o, at).Eval());
}
template <class Equation>
std::string IsNameDefined(Objects o, size_t at)
{
    return Tell(At<Equation>(o, at).IsVariableDefined(NameAt(o, at)));
}
template <class Equation>
std::string IsHandleDefined(Objects o, size_t at)
{
    return Tell(At<Equation>(o, at).IsVariableDefined(Another<Facade::Handle>(o, at)));
}
template <class Equation>
std::string ValueOfName(Objects o, size_t at)
{
    return Tell(At<Equation>(o, at).GetVariable(NameAt(o, at)));
}
template <class Equation>
std::string ValueOfHandle(Objects o, size_t at)
{
    return Tell(At<Equation>(o, at).GetVariable(o.handles[at]));
}
template <class Equation>
std::string HandleOf(Objects o, size_t at)
{
    const Facade::Handle handle = At<Equation>(o, at).GetVariableHandle(NameAt(o, at));
    return Tell(handle) + Tell(handle == o.handles[at]);
}
template <class Equation>
std::string NumVariables(Objects o, size_t at)
{
    return Tell(At<Equation>(o, at).GetNumVariables());
}
template <class Equation>
std::string Variables(Objects o, size_t at)
{
    std::string text;
    for (const auto& variable : At<Equation>(o, at).GetVariables())
        text += Tell(variable.first) + "=" + Tell(variable.second) + " ";
    return text;
}
template <class Equation>
std::string TableOf(Objects o, size_t at)
{
    typedef typename Equation::TruthTable Table;
    return Tell(At<Equation>(o, at).GetTruthTable().GetRows()) +
           Tell(Table(At<Equation>(o, at)) == At<Table>(o, at));
}
// Copies an object that is only queried.
template <class Equation>
std::string CopyOf(Objects o, size_t at)
{
    Equation copy(At<Equation>(o, at));
    const bool isSet = copy.SetVariable(NameAt(o, at), 1);
    return Tell(isSet) + Tell(copy.Eval()) + Tell(copy == At<Equation>(o, at));
}
std::string ImpOf(Objects o, size_t at)
{
    return Tell(o.equations[at].GetImp()->GetRoot());
}
std::string RootOf(Objects o, size_t at)
{
    const Node* const root = o.engines[at].GetRoot();
    return Tell(root) + Tell(root == o.engines[at ^ 1u].GetRoot());
}
std::string FoundRefusal(Objects o, size_t at)
{
    const String text = o.equations[at].GetEquation(true);
    const Facade::Refusal refusal = Facade::FindRefusal(text);
    const Facade::Refusal wrong = Engine::FindRefusal((Tell(text) + " & & x").c_str());
    return Tell(refusal.code) + std::to_string(refusal.offset) + Tell(wrong.code) +
           std::to_string(wrong.offset);
}

} // namespace

const std::vector<Question> kOfEquation = {
    {"Kq_BoolEquation::IsExpression() const", Is<Facade, &Facade::IsExpression>},
    {"Kq_BoolEquation::IsHexInitValue() const", Is<Facade, &Facade::IsHexInitValue>},
    {"Kq_BoolEquation::IsBinaryInitValue() const", Is<Facade, &Facade::IsBinaryInitValue>},
    {"Kq_BoolEquation::GetEquation(bool) const", Rendered<Facade, &Facade::GetEquation>},
    {"Kq_BoolEquation::GetEquationAlt1(bool) const", Rendered<Facade, &Facade::GetEquationAlt1>},
    {"Kq_BoolEquation::GetEquationAlt2(bool) const", Rendered<Facade, &Facade::GetEquationAlt2>},
    {"Kq_BoolEquation::GetEquationAlt3(bool) const", Rendered<Facade, &Facade::GetEquationAlt3>},
    {"Kq_BoolEquation::GetEquationAsExpression(bool) const",
     Rendered<Facade, &Facade::GetEquationAsExpression>},
    {"Kq_BoolEquation::GetEquationAsHexInitValue(bool) const", HexInitValue<Facade>},
    {"Kq_BoolEquation::GetEquationAsBinaryInitValue() const", BinaryInitValue<Facade>},
    {"Kq_BoolEquation::GetInitValueTermEquation() const", TermEquation<Facade>},
    {"Kq_BoolEquation::GetColumn(std::vector<unsigned long, std::allocator<unsigned long> >&) "
     "const",
     Column<Facade>},
    {"Kq_BoolEquation::GetColumn(std::vector<unsigned long, std::allocator<unsigned long> >&, bool "
     "(*)(void*), void*) const",
     WatchedColumn<Facade>},
    {"Kq_BoolEquation::operator!() const", HasNone<Facade>},
    {"Kq_BoolEquation::operator Kq_PtrTester*() const", HasSome<Facade>},
    {"Kq_BoolEquation::operator==(Kq_BoolEquation const&) const", IsEqual<Facade>},
    {"Kq_BoolEquation::operator!=(Kq_BoolEquation const&) const", IsNotEqual<Facade>},
    {"Kq_BoolEquation::Eval() const", Evaluated<Facade>},
    {"Kq_BoolEquation::IsVariableDefined(Port::StringBase<char> const&) const",
     IsNameDefined<Facade>},
    {"Kq_BoolEquation::IsVariableDefined(Kq_BoolEquation::Handle const&) const",
     IsHandleDefined<Facade>},
    {"Kq_BoolEquation::GetVariable(Port::StringBase<char> const&) const", ValueOfName<Facade>},
    {"Kq_BoolEquation::GetVariable(Kq_BoolEquation::Handle const&) const", ValueOfHandle<Facade>},
    {"Kq_BoolEquation::GetVariableHandle(Port::StringBase<char> const&) const", HandleOf<Facade>},
    {"Kq_BoolEquation::GetNumVariables() const", NumVariables<Facade>},
    {"Kq_BoolEquation::GetVariables() const", Variables<Facade>},
    {"Kq_BoolEquation::GetTruthTable() const", TableOf<Facade>},
    {"Kq_BoolEquation::Dbg() const", Dumped<Facade>},
    {"Kq_BoolEquation, copied", CopyOf<Facade>},
    {"Kq_BoolEquation::GetImp() const", ImpOf},
    {"Kq_BoolEquation::FindRefusal, static", FoundRefusal},
};

const std::vector<Question> kOfEngine = {
    {"Kq_BoolEquationImp::IsExpression() const", Is<Engine, &Engine::IsExpression>},
    {"Kq_BoolEquationImp::IsHexInitValue() const", Is<Engine, &Engine::IsHexInitValue>},
    {"Kq_BoolEquationImp::IsBinaryInitValue() const", Is<Engine, &Engine::IsBinaryInitValue>},
    {"Kq_BoolEquationImp::GetEquation(bool) const", Rendered<Engine, &Engine::GetEquation>},
    {"Kq_BoolEquationImp::GetEquationAlt1(bool) const", Rendered<Engine, &Engine::GetEquationAlt1>},
    {"Kq_BoolEquationImp::GetEquationAlt2(bool) const", Rendered<Engine, &Engine::GetEquationAlt2>},
    {"Kq_BoolEquationImp::GetEquationAlt3(bool) const", Rendered<Engine, &Engine::GetEquationAlt3>},
    {"Kq_BoolEquationImp::GetEquationAsExpression(bool) const",
     Rendered<Engine, &Engine::GetEquationAsExpression>},
    {"Kq_BoolEquationImp::GetEquationAsHexInitValue(bool) const", HexInitValue<Engine>},
    {"Kq_BoolEquationImp::GetEquationAsBinaryInitValue() const", BinaryInitValue<Engine>},
    {"Kq_BoolEquationImp::GetInitValueTermEquation() const", TermEquation<Engine>},
    {"Kq_BoolEquationImp::GetColumn(std::vector<unsigned long, std::allocator<unsigned long> >&) "
     "const",
     Column<Engine>},
    {"Kq_BoolEquationImp::GetColumn(std::vector<unsigned long, std::allocator<unsigned long> >&, "
     "bool (*)(void*), void*) const",
     WatchedColumn<Engine>},
    {"Kq_BoolEquationImp::operator!() const", HasNone<Engine>},
    {"Kq_BoolEquationImp::operator Kq_PtrTester*() const", HasSome<Engine>},
    {"Kq_BoolEquationImp::operator==(Kq_BoolEquationImp const&) const", IsEqual<Engine>},
    {"Kq_BoolEquationImp::operator!=(Kq_BoolEquationImp const&) const", IsNotEqual<Engine>},
    {"Kq_BoolEquationImp::Eval() const", Evaluated<Engine>},
    {"Kq_BoolEquationImp::IsVariableDefined(Port::StringBase<char> const&) const",
     IsNameDefined<Engine>},
    {"Kq_BoolEquationImp::IsVariableDefined(Kq_BoolEquation::Handle const&) const",
     IsHandleDefined<Engine>},
    {"Kq_BoolEquationImp::GetVariable(Port::StringBase<char> const&) const", ValueOfName<Engine>},
    {"Kq_BoolEquationImp::GetVariable(Kq_BoolEquation::Handle const&) const",
     ValueOfHandle<Engine>},
    {"Kq_BoolEquationImp::GetVariableHandle(Port::StringBase<char> const&) const",
     HandleOf<Engine>},
    {"Kq_BoolEquationImp::GetNumVariables() const", NumVariables<Engine>},
    {"Kq_BoolEquationImp::GetVariables() const", Variables<Engine>},
    {"Kq_BoolEquationImp::GetTruthTable() const", TableOf<Engine>},
    {"Kq_BoolEquationImp::Dbg() const", Dumped<Engine>},
    {"Kq_BoolEquationImp, copied", CopyOf<Engine>},
    {"Kq_BoolEquationImp::GetRoot() const", RootOf},
};

std::vector<Question> AllQuestions()
{
    std::vector<Question> all;
    for (const std::vector<Question>* list :
         {&kOfEquation, &kOfTables, &kOfEngine, &kOfEngineTables})
        all.insert(all.end(), list->begin(), list->end());
    return all;
}

} // namespace threads
