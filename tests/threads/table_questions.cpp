// Questions of tables, rows, handles and nodes.
// tests/random/check_operations.py compares the names here with the symbols of the library.
#include "threads/telling.h"

namespace threads {

namespace {

template <class Table>
std::string NamesOf(Objects o, size_t at)
{
    return Tell(At<Table>(o, at).GetVariableNames());
}
template <class Table>
std::string RowsOf(Objects o, size_t at)
{
    return Tell(Table(At<Table>(o, at)).GetRows());
}
// Asks about the last rows of two tables, or about rows made here if there are none.
template <class Table>
std::string AreRowsEqual(Objects o, size_t at)
{
    typedef typename Table::Row Row;
    const std::vector<Row> rows = At<Table>(o, at).GetRows();
    const std::vector<Row> others = Another<Table>(o, at).GetRows();
    const Row row = rows.empty() ? Row(0, {}) : rows.back();
    const Row other = others.empty() ? Row(1, {}) : others.back();
    return Tell(row == other) + Tell(row != other) + Tell(row.GetResultValue()) +
           Tell(row.GetVariableValues());
}
template <class Table>
std::string RowDumped(Objects o, size_t at)
{
    const auto rows = At<Table>(o, at).GetRows();
    if (!rows.empty())
        rows.back().Dbg();
    return "";
}

// Without an equation, a separate node is queried.
template <std::string (*ask)(const Node& node)>
std::string OfNode(Objects o, size_t at)
{
    const Node* const root = o.engines[at].GetRoot();
    return ask(root ? *root : Node(Node::ID, "x"));
}
template <const String& (Node::*token)() const>
std::string Spelling(const Node& node)
{
    return Tell((node.*token)());
}
std::string NodeValue(const Node& node)
{
    return Tell(node.Eval({{"x", 1u}, {"y", 6u}, {"z", 0u}}));
}
std::string TopParent(const Node& node)
{
    const Node* const child = node.GetLeftChild();
    return Tell((child ? child : &node)->GetTopParent() == &node);
}
std::string NodeDumped(const Node& node)
{
    node.Dbg();
    return "";
}
std::string IsNodeEqual(const Node& node)
{
    const Node copy(node);
    return Tell(copy == node) + Tell(node != Node());
}

} // namespace

const std::vector<Question> kOfTables = {
    {"Kq_BoolEquation::Handle::Dbg() const", Dumped<Facade::Handle>},
    {"Kq_BoolEquation::Handle::operator==(Kq_BoolEquation::Handle const&) const",
     IsEqual<Facade::Handle>},
    {"Kq_BoolEquation::Handle::operator!=(Kq_BoolEquation::Handle const&) const",
     IsNotEqual<Facade::Handle>},
    {"Kq_BoolEquation::TruthTable::GetVariableNames() const", NamesOf<Facade::TruthTable>},
    {"Kq_BoolEquation::TruthTable::GetRows() const", RowsOf<Facade::TruthTable>},
    {"Kq_BoolEquation::TruthTable::operator!() const", HasNone<Facade::TruthTable>},
    {"Kq_BoolEquation::TruthTable::operator Kq_PtrTester*() const", HasSome<Facade::TruthTable>},
    {"Kq_BoolEquation::TruthTable::operator==(Kq_BoolEquation::TruthTable const&) const",
     IsEqual<Facade::TruthTable>},
    {"Kq_BoolEquation::TruthTable::operator!=(Kq_BoolEquation::TruthTable const&) const",
     IsNotEqual<Facade::TruthTable>},
    {"Kq_BoolEquation::TruthTable::Dbg() const", Dumped<Facade::TruthTable>},
    {"Kq_BoolEquation::TruthTable::Row::GetResultValue() const", AreRowsEqual<Facade::TruthTable>},
    {"Kq_BoolEquation::TruthTable::Row::GetVariableValues() const",
     AreRowsEqual<Facade::TruthTable>},
    {"Kq_BoolEquation::TruthTable::Row::operator==(Kq_BoolEquation::TruthTable::Row const&) const",
     AreRowsEqual<Facade::TruthTable>},
    {"Kq_BoolEquation::TruthTable::Row::operator!=(Kq_BoolEquation::TruthTable::Row const&) const",
     AreRowsEqual<Facade::TruthTable>},
    {"Kq_BoolEquation::TruthTable::Row::Dbg() const", RowDumped<Facade::TruthTable>},
};

const std::vector<Question> kOfEngineTables = {
    {"Kq_BoolEquationImp::TruthTable::GetVariableNames() const", NamesOf<Engine::TruthTable>},
    {"Kq_BoolEquationImp::TruthTable::GetRows() const", RowsOf<Engine::TruthTable>},
    {"Kq_BoolEquationImp::TruthTable::operator!() const", HasNone<Engine::TruthTable>},
    {"Kq_BoolEquationImp::TruthTable::operator Kq_PtrTester*() const", HasSome<Engine::TruthTable>},
    {"Kq_BoolEquationImp::TruthTable::operator==(Kq_BoolEquationImp::TruthTable const&) const",
     IsEqual<Engine::TruthTable>},
    {"Kq_BoolEquationImp::TruthTable::operator!=(Kq_BoolEquationImp::TruthTable const&) const",
     IsNotEqual<Engine::TruthTable>},
    {"Kq_BoolEquationImp::TruthTable::Dbg() const", Dumped<Engine::TruthTable>},
    {"Kq_BoolEquationImp::TruthTable::Row::GetResultValue() const",
     AreRowsEqual<Engine::TruthTable>},
    {"Kq_BoolEquationImp::TruthTable::Row::GetVariableValues() const",
     AreRowsEqual<Engine::TruthTable>},
    {"Kq_BoolEquationImp::TruthTable::Row::operator==(Kq_BoolEquationImp::TruthTable::Row const&) "
     "const",
     AreRowsEqual<Engine::TruthTable>},
    {"Kq_BoolEquationImp::TruthTable::Row::operator!=(Kq_BoolEquationImp::TruthTable::Row const&) "
     "const",
     AreRowsEqual<Engine::TruthTable>},
    {"Kq_BoolEquationImp::TruthTable::Row::Dbg() const", RowDumped<Engine::TruthTable>},
    {"Kq_BoolEquationImp::Node::GetTypeName() const", OfNode<Spelling<&Node::GetTypeName>>},
    {"Kq_BoolEquationImp::Node::GetTokenAlt1() const", OfNode<Spelling<&Node::GetTokenAlt1>>},
    {"Kq_BoolEquationImp::Node::GetTokenAlt2() const", OfNode<Spelling<&Node::GetTokenAlt2>>},
    {"Kq_BoolEquationImp::Node::GetTokenAlt3() const", OfNode<Spelling<&Node::GetTokenAlt3>>},
    {"Kq_BoolEquationImp::Node::GetTopParent() const", OfNode<TopParent>},
    {"Kq_BoolEquationImp::Node::Dbg() const", OfNode<NodeDumped>},
    {"Kq_BoolEquationImp::Node::Eval(std::vector<std::pair<Port::StringBase<char>, unsigned int>, "
     "std::allocator<std::pair<Port::StringBase<char>, unsigned int> > > const&) const",
     OfNode<NodeValue>},
    {"Kq_BoolEquationImp::Node::operator==(Kq_BoolEquationImp::Node const&) const",
     OfNode<IsNodeEqual>},
    {"Kq_BoolEquationImp::Node::operator!=(Kq_BoolEquationImp::Node const&) const",
     OfNode<IsNodeEqual>},
};

} // namespace threads
