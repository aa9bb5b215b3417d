// tests/random/check_operations.py compares the names here with the symbols of the library.
#include "random/operations.h"

namespace operations {

namespace {

typedef Engine::TruthTable Table;

const char kText[] = "(P | Q ~ & R) ^ ~quite_a_long_name_for_a_net & P";
const char kLongName[] = "another_variable_whose_name_needs_memory";

const Node& Root(const Objects& o)
{
    return *o.engine.GetRoot();
}

// More operands wait for each other, on either side, than a walk keeps without the heap.
std::string Deep()
{
    std::string text = "A";
    for (int depth = 0; depth < 100; ++depth)
        text = depth % 2 != 0 ? "(" + text + ") & B" : "B ^ (" + text + ")";
    return text;
}

// Its size differs from its base's, so the class's allocator does not serve it.
struct LargerNode : Node {
    unsigned int m_more[4] = {};
};

} // namespace

const std::vector<Operation> kOfEngine = {
    {"Kq_BoolEquationImp::Kq_BoolEquationImp()", [](Objects&) { const Engine made; }},
    {"Kq_BoolEquationImp::Kq_BoolEquationImp(Kq_BoolEquationImp const&)",
     [](Objects& o) {
         const Engine made(o.engine);
         EXPECT_TRUE(made == o.engine);
     }},
    {"Kq_BoolEquationImp::~Kq_BoolEquationImp()", [](Objects& o) { delete new Engine(o.engine); }},
    {"Kq_BoolEquationImp::operator new(unsigned long)",
     [](Objects&) {
         Engine::operator delete(Engine::operator new(sizeof(Engine)), sizeof(Engine));
         void* larger = Engine::operator new(sizeof(Engine) + 1);
         Engine::operator delete(larger, sizeof(Engine) + 1);
     }},
    {"Kq_BoolEquationImp::operator delete(void*, unsigned long)",
     [](Objects&) {
         Engine::operator delete(nullptr, sizeof(Engine));
         Engine::operator delete(nullptr, sizeof(Engine) + 1);
         delete new Engine;
     }},
    {"Kq_BoolEquationImp::operator=(Kq_BoolEquationImp const&)",
     [](Objects& o) {
         Engine made;
         made = o.engine;
         o.engine = Engine();
     }},
    {"Kq_BoolEquationImp::Copy(Kq_BoolEquationImp const&)",
     [](Objects& o) {
         Engine made;
         made.Copy(o.engine);
         o.engine.Copy(o.other);
     }},
    {"Kq_BoolEquationImp::Clear()", [](Objects& o) { o.engine.Clear(); }},
    {"Kq_BoolEquationImp::SetEquation(Port::StringBase<char> const&)",
     [](Objects& o) {
         o.other.SetEquation("0x1e");
         o.engine.SetEquation(kText);
         if (!Engine::GetInternalDebugMode()) // its trace would have a hundred thousand messages
             o.engine.SetEquation(Deep().c_str());
         o.engine.SetEquation(o.other.GetVariables().at(0).first);
     }},
    {"Kq_BoolEquationImp::SetEquationWithExplicitTerms(std::vector<Port::StringBase<char>, "
     "std::allocator<Port::StringBase<char> > > const&, Port::StringBase<char> const&, bool, bool)",
     [](Objects& o) {
         o.engine.SetEquationWithExplicitTerms({"A", kLongName}, "0x6", true, false);
         o.engine.SetEquationWithExplicitTerms({"A", kLongName}, "A & B", false, true);
     }},
    {"Kq_BoolEquationImp::TokenizeNodes(char const*)",
     [](Objects& o) {
         Engine made;
         made.TokenizeNodes(kText);
         o.engine.TokenizeNodes(kText); // the object has nodes already
         o.engine.Clear();
         o.engine.TokenizeNodes("A & $");
     }},
    {"Kq_BoolEquationImp::BuildTree()",
     [](Objects&) {
         Engine made;
         made.TokenizeNodes(kText);
         made.BuildTree();
         Engine refused;
         refused.TokenizeNodes("A & & B");
         refused.BuildTree();
     }},
    {"Kq_BoolEquationImp::Eval() const",
     [](Objects& o) {
         o.engine.Eval();
         for (const char* name : {"D", "E", "F", "G"})
             o.other.DefineVariable(name, 1);
         o.other.Eval(); // node by node, then compiled
         o.other.Eval();
     }},
    {"Kq_BoolEquationImp::operator==(Kq_BoolEquationImp const&) const",
     [](Objects& o) {
         Engine made;
         made.SetEquation("a_name_that_needs_memory & ~(B | C) ^ 0");
         Ask(made == o.engine);
     }},
    {"Kq_BoolEquationImp::operator!=(Kq_BoolEquationImp const&) const",
     [](Objects& o) { Ask(o.engine != Engine()); }},
    {"Kq_BoolEquationImp::operator!() const", [](Objects& o) { Ask(!o.engine); }},
    {"Kq_BoolEquationImp::operator Kq_PtrTester*() const",
     [](Objects& o) { Ask(static_cast<Kq_PtrTester*>(o.engine)); }},
    {"Kq_BoolEquationImp::IsExpression() const", [](Objects& o) { o.engine.IsExpression(); }},
    {"Kq_BoolEquationImp::IsHexInitValue() const", [](Objects& o) { o.engine.IsHexInitValue(); }},
    {"Kq_BoolEquationImp::IsBinaryInitValue() const",
     [](Objects& o) { o.engine.IsBinaryInitValue(); }},
    {"Kq_BoolEquationImp::GetEquation(bool) const", [](Objects& o) { o.engine.GetEquation(true); }},
    {"Kq_BoolEquationImp::GetEquationAlt1(bool) const",
     [](Objects& o) { o.engine.GetEquationAlt1(true); }},
    {"Kq_BoolEquationImp::GetEquationAlt2(bool) const",
     [](Objects& o) { o.engine.GetEquationAlt2(true); }},
    {"Kq_BoolEquationImp::GetEquationAlt3(bool) const",
     [](Objects& o) { o.engine.GetEquationAlt3(true); }},
    {"Kq_BoolEquationImp::GetEquationAsExpression(bool) const",
     [](Objects& o) { o.engine.GetEquationAsExpression(true); }},
    {"Kq_BoolEquationImp::GetEquationAsHexInitValue(bool) const",
     [](Objects& o) { o.engine.GetEquationAsHexInitValue(false); }},
    {"Kq_BoolEquationImp::GetEquationAsBinaryInitValue() const",
     [](Objects& o) {
         for (const char* name : {"D", "E", "F", "G"})
             o.engine.DefineVariable(name, 1);
         o.engine.GetEquationAsBinaryInitValue();
     }},
    {"Kq_BoolEquationImp::GetInitValueTermEquation() const",
     [](Objects& o) { o.engine.GetInitValueTermEquation(); }},
    {"Kq_BoolEquationImp::DefineVariable(Port::StringBase<char> const&, unsigned int)",
     [](Objects& o) { o.engine.DefineVariable(kLongName, 1); }},
    {"Kq_BoolEquationImp::IsVariableDefined(Port::StringBase<char> const&) const",
     [](Objects& o) { o.engine.IsVariableDefined(kLongName); }},
    {"Kq_BoolEquationImp::IsVariableDefined(Kq_BoolEquation::Handle const&) const",
     [](Objects& o) { o.engine.IsVariableDefined(o.handle); }},
    {"Kq_BoolEquationImp::SetVariable(Port::StringBase<char> const&, unsigned int)",
     [](Objects& o) { o.engine.SetVariable("B", 1); }},
    {"Kq_BoolEquationImp::SetVariable(Kq_BoolEquation::Handle const&, unsigned int)",
     [](Objects& o) { o.engine.SetVariable(o.handle, 1); }},
    {"Kq_BoolEquationImp::GetVariable(Port::StringBase<char> const&) const",
     [](Objects& o) { o.engine.GetVariable("B"); }},
    {"Kq_BoolEquationImp::GetVariable(Kq_BoolEquation::Handle const&) const",
     [](Objects& o) { o.engine.GetVariable(o.handle); }},
    {"Kq_BoolEquationImp::GetVariableHandle(Port::StringBase<char> const&) const",
     [](Objects& o) { o.handle = o.engine.GetVariableHandle("C"); }},
    {"Kq_BoolEquationImp::GetNumVariables() const", [](Objects& o) { o.engine.GetNumVariables(); }},
    {"Kq_BoolEquationImp::GetVariables() const", [](Objects& o) { Ask(o.engine.GetVariables()); }},
    {"Kq_BoolEquationImp::GetTruthTable() const", [](Objects& o) { o.engine.GetTruthTable(); }},
    {"Kq_BoolEquationImp::FindRefusal(Port::StringBase<char> const&, "
     "std::vector<Port::StringBase<char>, std::allocator<Port::StringBase<char> > > const*)",
     [](Objects&) {
         Engine::FindRefusal(kText);
         Engine::FindRefusal("P & (another_name_nobody_has_used ~ | Q) R");
     }},
    {"Kq_BoolEquationImp::GetColumn(std::vector<unsigned long, std::allocator<unsigned long> >&) "
     "const",
     [](Objects& o) {
         std::vector<uint64_t> words;
         o.engine.GetColumn(words);
         o.other.SetEquation("0x4b");
         o.other.GetColumn(words);
     }},
    {"Kq_BoolEquationImp::GetColumn(std::vector<unsigned long, std::allocator<unsigned long> >&, "
     "bool (*)(void*), void*) const",
     [](Objects& o) {
         std::vector<uint64_t> words;
         const auto never = [](void*) { return false; };
         o.engine.GetColumn(words, never, nullptr);
     }},
    {"Kq_BoolEquationImp::GetRoot() const", [](Objects& o) { Ask(o.engine.GetRoot()); }},
    {"Kq_BoolEquationImp::Dbg() const", [](Objects& o) { o.engine.Dbg(); }},
    {"Kq_BoolEquationImp::GetInternalDebugMode()",
     [](Objects&) { Ask(Engine::GetInternalDebugMode()); }},
    {"Kq_BoolEquationImp::SetInternalDebugMode(bool)",
     [](Objects&) { Engine::SetInternalDebugMode(Engine::GetInternalDebugMode()); }},
};

const std::vector<Operation> kOfEngineTables = {
    {"Kq_BoolEquationImp::TruthTable::TruthTable()", [](Objects&) { const Table made; }},
    {"Kq_BoolEquationImp::TruthTable::TruthTable(Kq_BoolEquationImp const&)",
     [](Objects& o) { const Table made(o.engine); }},
    {"Kq_BoolEquationImp::TruthTable::TruthTable(Kq_BoolEquationImp::TruthTable const&)",
     [](Objects& o) {
         const Table made(o.engineTable);
         EXPECT_TRUE(made == o.engineTable);
     }},
    {"Kq_BoolEquationImp::TruthTable::~TruthTable()",
     [](Objects& o) { delete new Table(o.engineTable); }},
    {"Kq_BoolEquationImp::TruthTable::operator=(Kq_BoolEquationImp::TruthTable const&)",
     [](Objects& o) {
         Table made;
         made = o.engineTable;
         o.engineTable = Table();
     }},
    {"Kq_BoolEquationImp::TruthTable::operator=(Kq_BoolEquationImp const&)",
     [](Objects& o) { o.engineTable = o.other; }},
    {"Kq_BoolEquationImp::TruthTable::Build(Kq_BoolEquationImp const&)",
     [](Objects& o) { o.engineTable.Build(o.other); }},
    {"Kq_BoolEquationImp::TruthTable::GetVariableNames() const",
     [](Objects& o) { Ask(o.engineTable.GetVariableNames()); }},
    {"Kq_BoolEquationImp::TruthTable::GetRows() const",
     [](Objects& o) { Ask(o.engineTable.GetRows()); }},
    {"Kq_BoolEquationImp::TruthTable::operator==(Kq_BoolEquationImp::TruthTable const&) const",
     [](Objects& o) { Ask(o.engineTable == o.otherEngineTable); }},
    {"Kq_BoolEquationImp::TruthTable::operator!=(Kq_BoolEquationImp::TruthTable const&) const",
     [](Objects& o) { Ask(o.engineTable != o.otherEngineTable); }},
    {"Kq_BoolEquationImp::TruthTable::operator!() const", [](Objects& o) { Ask(!o.engineTable); }},
    {"Kq_BoolEquationImp::TruthTable::operator Kq_PtrTester*() const",
     [](Objects& o) { Ask(static_cast<Kq_PtrTester*>(o.engineTable)); }},
    {"Kq_BoolEquationImp::TruthTable::Dbg() const", [](Objects& o) { o.engineTable.Dbg(); }},

    {"Kq_BoolEquationImp::TruthTable::Row::Row(unsigned int, std::vector<unsigned int, "
     "std::allocator<unsigned int> > const&)",
     [](Objects&) {
         const Table::Row made(1, {1, 0, 1});
     }},
    {"Kq_BoolEquationImp::TruthTable::Row::Row(Kq_BoolEquationImp::TruthTable::Row const&)",
     [](Objects& o) {
         const Table::Row made(o.engineRow);
         EXPECT_TRUE(made == o.engineRow);
     }},
    {"Kq_BoolEquationImp::TruthTable::Row::~Row()",
     [](Objects& o) { delete new Table::Row(o.engineRow); }},
    {"Kq_BoolEquationImp::TruthTable::Row::operator=(Kq_BoolEquationImp::TruthTable::Row const&)",
     [](Objects& o) { o.engineRow = o.engineTable.GetRows().at(3); }},
    {"Kq_BoolEquationImp::TruthTable::Row::GetResultValue() const",
     [](Objects& o) { o.engineRow.GetResultValue(); }},
    {"Kq_BoolEquationImp::TruthTable::Row::GetVariableValues() const",
     [](Objects& o) { Ask(o.engineRow.GetVariableValues()); }},
    {"Kq_BoolEquationImp::TruthTable::Row::operator==(Kq_BoolEquationImp::TruthTable::Row const&) "
     "const",
     [](Objects& o) { Ask(o.engineRow == o.engineTable.GetRows().at(3)); }},
    {"Kq_BoolEquationImp::TruthTable::Row::operator!=(Kq_BoolEquationImp::TruthTable::Row const&) "
     "const",
     [](Objects& o) { Ask(o.engineRow != o.engineTable.GetRows().at(3)); }},
    {"Kq_BoolEquationImp::TruthTable::Row::Dbg() const", [](Objects& o) { o.engineRow.Dbg(); }},

    {"Kq_BoolEquationImp::Node::operator new(unsigned long)",
     [](Objects&) {
         delete new Node(Node::ID, kLongName);
         delete new LargerNode;
     }},
    {"Kq_BoolEquationImp::Node::operator delete(void*, unsigned long)",
     [](Objects&) {
         Node::operator delete(nullptr, sizeof(Node));
         Node::operator delete(nullptr, sizeof(LargerNode));
         delete new LargerNode;
     }},
    // Members defined in the header: copies, and what a name needs.
    {"Kq_BoolEquationImp::Node, copied",
     [](Objects& o) {
         const Node made(o.node);
         Node assigned;
         assigned = made;
         assigned.SetToken(kText);
     }},
    {"Kq_BoolEquationImp::Node::GetTopParent() const",
     [](Objects& o) { Root(o).GetLeftChild()->GetTopParent(); }},
    {"Kq_BoolEquationImp::Node::GetTypeName() const",
     [](Objects& o) { Ask(o.node.GetTypeName()); }},
    {"Kq_BoolEquationImp::Node::GetTokenAlt1() const",
     [](Objects& o) { Ask(o.node.GetTokenAlt1()); }},
    {"Kq_BoolEquationImp::Node::GetTokenAlt2() const",
     [](Objects& o) { Ask(o.node.GetTokenAlt2()); }},
    {"Kq_BoolEquationImp::Node::GetTokenAlt3() const",
     [](Objects& o) { Ask(o.node.GetTokenAlt3()); }},
    {"Kq_BoolEquationImp::Node::operator==(Kq_BoolEquationImp::Node const&) const",
     [](Objects& o) { Ask(o.node == Root(o)); }},
    {"Kq_BoolEquationImp::Node::operator!=(Kq_BoolEquationImp::Node const&) const",
     [](Objects& o) { Ask(o.node != Root(o)); }},
    {"Kq_BoolEquationImp::Node::Eval(std::vector<std::pair<Port::StringBase<char>, unsigned int>, "
     "std::allocator<std::pair<Port::StringBase<char>, unsigned int> > > const&) const",
     [](Objects& o) {
         Root(o).Eval({{"x", 1u}, {"y", 0u}, {kLongName, 1u}});
         if (Engine::GetInternalDebugMode())
             return; // its trace would have a hundred thousand messages
         Engine deep;
         deep.SetEquation(Deep().c_str());
         deep.GetRoot()->Eval(deep.GetVariables());
     }},
    {"Kq_BoolEquationImp::Node::Dbg() const", [](Objects& o) { Root(o).Dbg(); }},

    {"Kq_BoolEquationImp::StringMgr::StringMgr()", [](Objects&) { const Engine::StringMgr made; }},
    {"Kq_BoolEquationImp::StringMgr::~StringMgr()",
     [](Objects&) {
         Engine::StringMgr made;
         made.find("a");
         made.find("ab");
         made.find("ac");
     }},
    {"Kq_BoolEquationImp::StringMgr::find(char const*)",
     [](Objects& o) {
         Ask(o.pool.find("another_variable_whose_name_is_not_the_same"));
         Ask(o.pool.find("another"));
         Ask(o.pool.find(kText));
         Ask(o.pool.find(nullptr));
     }},
};

} // namespace operations
