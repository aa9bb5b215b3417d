// tests/random/check_operations.py compares the names here with the symbols of the library.
#include "random/operations.h"

namespace operations {

namespace {

const char kText[] = "a_name_that_needs_memory & ~(B | C) ^ 1";
const char kOtherText[] = "(P | Q ~ & R) ^ ~quite_a_long_name_for_a_net & P";
const char kLongName[] = "another_variable_whose_name_needs_memory";

std::vector<String> Terms()
{
    return {"A", "B", "a_listed_input_with_a_long_name"};
}

} // namespace

Objects::Objects()
    : a(kText), b(a), table(Equation("X | Y")), otherTable(Equation("X & Y")), row(1, {0, 1, 1}),
      handle(a.GetVariableHandle("B")), engineRow(0, {1, 0}), node(Node::ID, kLongName)
{
    engine.SetEquation(kText);
    other = engine;
    engineTable = engine;
    otherEngineTable = engine;
    pool.find(kLongName);
}

const std::vector<Operation> kOfEquation = {
    {"Kq_BoolEquation::Kq_BoolEquation()", [](Objects&) { const Equation made; }},
    {"Kq_BoolEquation::Kq_BoolEquation(Kq_BoolEquation const&)",
     [](Objects& o) {
         const Equation made(o.a);
         EXPECT_TRUE(made == o.a);
     }},
    {"Kq_BoolEquation::Kq_BoolEquation(Port::StringBase<char> const&)",
     [](Objects&) { const Equation made(kOtherText); }},
    {"Kq_BoolEquation::~Kq_BoolEquation()", [](Objects& o) { delete new Equation(o.a); }},
    {"Kq_BoolEquation::operator=(Kq_BoolEquation const&)",
     [](Objects& o) {
         const Equation source(kOtherText);
         o.a = source;
     }},
    {"Kq_BoolEquation::Copy(Kq_BoolEquation const&)",
     [](Objects& o) {
         Equation copy;
         copy.Copy(o.a);
         o.b.Copy(Equation());
     }},
    {"Kq_BoolEquation::SetEquationFromEquation(Kq_BoolEquation const&)",
     [](Objects& o) { o.a.SetEquationFromEquation(o.a); }},
    {"Kq_BoolEquation::Clear()", [](Objects& o) { o.a.Clear(); }},
    {"Kq_BoolEquation::SetEquation(Port::StringBase<char> const&)",
     [](Objects& o) {
         o.b.SetEquation(kOtherText);
         o.b.SetEquation("P | Q $");
         o.b.SetEquation("(P ~ & Q) & R ~ | S & ~ | T");
         o.a.SetEquation("0x96");
         o.a.SetEquation("0x9");
     }},
    {"Kq_BoolEquation::SetEquationWithExplicitTerms(std::vector<Port::StringBase<char>, "
     "std::allocator<Port::StringBase<char> > > const&, Port::StringBase<char> const&, bool, bool)",
     [](Objects& o) {
         o.a.SetEquationWithExplicitTerms(Terms(), "A & D", false, false);
         o.b.SetEquationWithExplicitTerms(Terms(), "0x6b", true, true);
     }},
    {"Kq_BoolEquation::IsExpression() const", [](Objects& o) { o.a.IsExpression(); }},
    {"Kq_BoolEquation::IsHexInitValue() const", [](Objects& o) { o.a.IsHexInitValue(); }},
    {"Kq_BoolEquation::IsBinaryInitValue() const", [](Objects& o) { o.a.IsBinaryInitValue(); }},
    {"Kq_BoolEquation::GetEquation(bool) const", [](Objects& o) { o.a.GetEquation(true); }},
    {"Kq_BoolEquation::GetEquationAlt1(bool) const", [](Objects& o) { o.a.GetEquationAlt1(true); }},
    {"Kq_BoolEquation::GetEquationAlt2(bool) const", [](Objects& o) { o.a.GetEquationAlt2(true); }},
    {"Kq_BoolEquation::GetEquationAlt3(bool) const",
     [](Objects& o) { o.a.GetEquationAlt3(false); }},
    {"Kq_BoolEquation::GetEquationAsExpression(bool) const",
     [](Objects& o) { o.a.GetEquationAsExpression(true); }},
    {"Kq_BoolEquation::GetEquationAsHexInitValue(bool) const",
     [](Objects& o) {
         o.a.DefineVariable("D", 0);
         o.a.DefineVariable("E", 0);
         o.a.DefineVariable("F", 0);
         o.a.DefineVariable("G", 0);
         o.a.GetEquationAsHexInitValue(true);
     }},
    {"Kq_BoolEquation::GetEquationAsBinaryInitValue() const",
     [](Objects& o) { o.a.GetEquationAsBinaryInitValue(); }},
    {"Kq_BoolEquation::GetInitValueTermEquation() const",
     [](Objects& o) { o.a.GetInitValueTermEquation(); }},
    {"Kq_BoolEquation::FindRefusal(Port::StringBase<char> const&, "
     "std::vector<Port::StringBase<char>, std::allocator<Port::StringBase<char> > > const*)",
     [](Objects&) {
         const std::vector<String> terms = Terms();
         EXPECT_EQ(Equation::FindRefusal(kText).code, Equation::Refusal::NONE);
         Equation::FindRefusal("(P | a_name_nobody_has_used $) & Q", &terms);
         Equation::FindRefusal("0x9", &terms);
     }},
    {"Kq_BoolEquation::GetColumn(std::vector<unsigned long, std::allocator<unsigned long> >&) "
     "const",
     [](Objects& o) {
         std::vector<uint64_t> words;
         o.a.GetColumn(words);
     }},
    {"Kq_BoolEquation::GetColumn(std::vector<unsigned long, std::allocator<unsigned long> >&, "
     "bool (*)(void*), void*) const",
     [](Objects& o) {
         std::vector<uint64_t> words;
         const auto always = [](void*) { return true; };
         o.a.GetColumn(words, always, nullptr);
     }},
    {"Kq_BoolEquation::operator!() const", [](Objects& o) { Ask(!o.a); }},
    {"Kq_BoolEquation::operator Kq_PtrTester*() const",
     [](Objects& o) { Ask(static_cast<Kq_PtrTester*>(o.a)); }},
    {"Kq_BoolEquation::operator==(Kq_BoolEquation const&) const",
     [](Objects& o) { Ask(o.a == Equation(kText)); }},
    {"Kq_BoolEquation::operator!=(Kq_BoolEquation const&) const",
     [](Objects& o) { Ask(o.a != Equation(kText)); }},
    {"Kq_BoolEquation::Eval() const",
     [](Objects& o) {
         o.a.Eval();
         for (const char* name : {"D", "E", "F", "G"})
             o.b.DefineVariable(name, 1);
         o.b.Eval(); // node by node, then compiled
         o.b.Eval();
     }},
    {"Kq_BoolEquation::DefineVariable(Port::StringBase<char> const&, unsigned int)",
     [](Objects& o) { o.a.DefineVariable(kLongName, 1); }},
    {"Kq_BoolEquation::IsVariableDefined(Port::StringBase<char> const&) const",
     [](Objects& o) { o.a.IsVariableDefined(kLongName); }},
    {"Kq_BoolEquation::IsVariableDefined(Kq_BoolEquation::Handle const&) const",
     [](Objects& o) { o.a.IsVariableDefined(o.handle); }},
    {"Kq_BoolEquation::SetVariable(Port::StringBase<char> const&, unsigned int)",
     [](Objects& o) { o.a.SetVariable("a_name_that_needs_memory", 1); }},
    {"Kq_BoolEquation::SetVariable(Kq_BoolEquation::Handle const&, unsigned int)",
     [](Objects& o) { o.a.SetVariable(o.handle, 1); }},
    {"Kq_BoolEquation::GetVariable(Port::StringBase<char> const&) const",
     [](Objects& o) { o.a.GetVariable("a_name_that_needs_memory"); }},
    {"Kq_BoolEquation::GetVariable(Kq_BoolEquation::Handle const&) const",
     [](Objects& o) { o.a.GetVariable(o.handle); }},
    {"Kq_BoolEquation::GetVariableHandle(Port::StringBase<char> const&) const",
     [](Objects& o) { o.handle = o.a.GetVariableHandle("C"); }},
    {"Kq_BoolEquation::GetNumVariables() const", [](Objects& o) { o.a.GetNumVariables(); }},
    {"Kq_BoolEquation::GetVariables() const", [](Objects& o) { Ask(o.a.GetVariables()); }},
    {"Kq_BoolEquation::GetTruthTable() const", [](Objects& o) { o.a.GetTruthTable(); }},
    {"Kq_BoolEquation::GetImp() const", [](Objects& o) { o.a.GetImp(); }},
    {"Kq_BoolEquation::Dbg() const", [](Objects& o) { o.a.Dbg(); }},
};

const std::vector<Operation> kOfTables = {
    {"Kq_BoolEquation::Handle::Handle()", [](Objects&) { const Handle made; }},
    {"Kq_BoolEquation::Handle::Handle(Kq_BoolEquation::Handle const&)",
     [](Objects& o) {
         const Handle made(o.handle);
         EXPECT_TRUE(made == o.handle);
     }},
    {"Kq_BoolEquation::Handle::~Handle()", [](Objects& o) { delete new Handle(o.handle); }},
    {"Kq_BoolEquation::Handle::operator=(Kq_BoolEquation::Handle const&)",
     [](Objects& o) {
         Handle made;
         made = o.handle;
         o.handle = o.a.GetVariableHandle("none");
     }},
    {"Kq_BoolEquation::Handle::operator==(Kq_BoolEquation::Handle const&) const",
     [](Objects& o) { Ask(o.handle == Handle()); }},
    {"Kq_BoolEquation::Handle::operator!=(Kq_BoolEquation::Handle const&) const",
     [](Objects& o) { Ask(o.handle != Handle()); }},
    {"Kq_BoolEquation::Handle::Dbg() const", [](Objects& o) { o.handle.Dbg(); }},

    {"Kq_BoolEquation::TruthTable::TruthTable()",
     [](Objects&) { const Equation::TruthTable made; }},
    {"Kq_BoolEquation::TruthTable::TruthTable(Kq_BoolEquation::TruthTable const&)",
     [](Objects& o) {
         const Equation::TruthTable made(o.table);
         EXPECT_TRUE(made == o.table);
     }},
    {"Kq_BoolEquation::TruthTable::TruthTable(Kq_BoolEquation const&)",
     [](Objects& o) { const Equation::TruthTable made(o.a); }},
    {"Kq_BoolEquation::TruthTable::~TruthTable()",
     [](Objects& o) { delete new Equation::TruthTable(o.table); }},
    {"Kq_BoolEquation::TruthTable::operator=(Kq_BoolEquation::TruthTable const&)",
     [](Objects& o) { o.table = o.otherTable; }},
    {"Kq_BoolEquation::TruthTable::operator=(Kq_BoolEquation const&)",
     [](Objects& o) { o.table = o.a; }},
    {"Kq_BoolEquation::TruthTable::operator==(Kq_BoolEquation::TruthTable const&) const",
     [](Objects& o) { Ask(o.table == o.otherTable); }},
    {"Kq_BoolEquation::TruthTable::operator!=(Kq_BoolEquation::TruthTable const&) const",
     [](Objects& o) { Ask(o.table != o.otherTable); }},
    {"Kq_BoolEquation::TruthTable::operator!() const", [](Objects& o) { Ask(!o.table); }},
    {"Kq_BoolEquation::TruthTable::operator Kq_PtrTester*() const",
     [](Objects& o) { Ask(static_cast<Kq_PtrTester*>(o.table)); }},
    {"Kq_BoolEquation::TruthTable::GetVariableNames() const",
     [](Objects& o) { o.table.GetVariableNames(); }},
    {"Kq_BoolEquation::TruthTable::GetRows() const", [](Objects& o) { o.table.GetRows(); }},
    {"Kq_BoolEquation::TruthTable::Dbg() const", [](Objects& o) { o.table.Dbg(); }},

    {"Kq_BoolEquation::TruthTable::Row::Row(unsigned int, std::vector<unsigned int, "
     "std::allocator<unsigned int> > const&)",
     [](Objects&) {
         const Equation::TruthTable::Row made(1, {1, 0, 1});
     }},
    {"Kq_BoolEquation::TruthTable::Row::Row(Kq_BoolEquation::TruthTable::Row const&)",
     [](Objects& o) {
         const Equation::TruthTable::Row made(o.row);
         EXPECT_TRUE(made == o.row);
     }},
    {"Kq_BoolEquation::TruthTable::Row::~Row()",
     [](Objects& o) { delete new Equation::TruthTable::Row(o.row); }},
    {"Kq_BoolEquation::TruthTable::Row::operator=(Kq_BoolEquation::TruthTable::Row const&)",
     [](Objects& o) { o.row = o.table.GetRows().at(2); }},
    {"Kq_BoolEquation::TruthTable::Row::operator==(Kq_BoolEquation::TruthTable::Row const&) const",
     [](Objects& o) { Ask(o.row == o.table.GetRows().at(2)); }},
    {"Kq_BoolEquation::TruthTable::Row::operator!=(Kq_BoolEquation::TruthTable::Row const&) const",
     [](Objects& o) { Ask(o.row != o.table.GetRows().at(2)); }},
    {"Kq_BoolEquation::TruthTable::Row::GetResultValue() const",
     [](Objects& o) { o.row.GetResultValue(); }},
    {"Kq_BoolEquation::TruthTable::Row::GetVariableValues() const",
     [](Objects& o) { o.row.GetVariableValues(); }},
    {"Kq_BoolEquation::TruthTable::Row::Dbg() const", [](Objects& o) { o.row.Dbg(); }},
};

} // namespace operations
