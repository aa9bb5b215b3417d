// What Dbg prints for equations, truth tables, rows and handles, with one Emit for each piece.
#include "reference/equation.h"
#include "reference/node_dump.h"

namespace reference {

namespace {

void EngineSays(const std::string& text)
{
    Emit(Module::Engine, kAnyLine, text);
}

void FacadeSays(const std::string& text)
{
    Emit(Module::Facade, kAnyLine, text);
}

std::string Count(size_t count)
{
    return std::to_string(count);
}

} // namespace

void Handle::Dbg() const
{
    FacadeSays("Kq_BoolEquation::Handle::Dbg");
    FacadeSays("Size = " + Count(size()) + "\n");
    for (size_t position = 0; position < size(); ++position)
        FacadeSays("Entry[" + Count(position) + "] = " + Decimal(m_values[position]) + "\n");
}

void Row::Dbg() const
{
    EngineSays("    Row: " + Decimal(m_result_value) + "=");
    for (unsigned int value : m_variable_values)
        EngineSays(Decimal(value));
    EngineSays("\n");
}

void TruthTable::Dbg() const
{
    EngineSays("TruthTable\n");
    EngineSays("  Eqn: \"" + CText(m_equation) + "\"\n");
    EngineSays("  NumCols: " + Count(m_variable_names.size()) + "\n");
    for (size_t column = 0; column < m_variable_names.size(); ++column)
        EngineSays("  Col[" + Count(column + 1) + "] = \"" + CText(m_variable_names[column]) +
                   "\"\n");
    EngineSays("  NumRows: " + Count(m_rows.size()) + "\n");
    if (!m_rows.empty()) {
        EngineSays("   ");
        EngineSays("   ");
        EngineSays("  v");
        for (size_t column = 0; column < m_variable_names.size(); ++column)
            EngineSays(" " + PadLeft(Count(column + 1), 2));
        EngineSays("\n");
        EngineSays("   ");
        EngineSays("   ");
        EngineSays(" ==");
        for (size_t column = 0; column < m_variable_names.size(); ++column)
            EngineSays(" ==");
        EngineSays("\n");
    }
    for (size_t row = 0; row < m_rows.size(); ++row) {
        EngineSays("   ");
        EngineSays(" " + PadLeft(Count(row + 1), 2));
        EngineSays(" " + PadLeft(Decimal(m_rows[row].GetResultValue()), 2));
        for (unsigned int value : m_rows[row].GetVariableValues())
            EngineSays("  " + Decimal(value));
        EngineSays("\n");
    }
}

std::string Equation::NodeReference(int node) const
{
    for (size_t position = 0; position < m_store->list.size(); ++position) {
        if (node != kNone && m_store->list[position] == node)
            return " [" + ThreeDigits(position) + "]";
    }
    return " -----";
}

void Equation::DumpVariables() const
{
    EngineSays("NumVariables = " + Count(m_variables.size()) + "\n");
    EngineSays("\n");
    EngineSays("  Id Name             Value\n");
    EngineSays("  == ================ =====\n");
    for (size_t index = 0; index < m_variables.size(); ++index)
        EngineSays("  " + PadLeft(Count(index + 1), 2) + " " +
                   PadRight(CText(m_variables[index].first), 16) + " " +
                   PadLeft(Decimal(m_variables[index].second), 5) + "\n");
    EngineSays("\n");
}

void Equation::DumpList() const
{
    EngineSays("NumNodes = " + Count(m_store->list.size()) + "\n");
    EngineSays("Root = ");
    EngineSays(NodeReference(m_store->root));
    EngineSays("\n");
    if (!m_store->list.empty()) {
        EngineSays("\n");
        EngineSays("     Id     Par  Left Right\n");
        EngineSays("   =====   ===== ===== =====\n");
    }
    for (size_t position = 0; position < m_store->list.size(); ++position) {
        const Node& node = At(m_store->list[position]);
        EngineSays("   [" + ThreeDigits(position) + "] =");
        EngineSays(NodeReference(node.parent));
        EngineSays(NodeReference(node.left));
        EngineSays(NodeReference(node.right));
        EngineSays(" " + PadRight(TypeName(node.type), 12));
        EngineSays(" " + CText(node.token));
        EngineSays("\n");
    }
    EngineSays("\n");
}

void Equation::Dbg() const
{
    EngineSays("Bool Equation = " + CText(GetEquation(false)) + "\n");
    EngineSays("Bool Equation Alt1 = " + CText(GetEquationAlt1(false)) + "\n");
    EngineSays("Bool Equation Alt2 = " + CText(GetEquationAlt2(false)) + "\n");
    EngineSays("Bool Equation Alt3 = " + CText(GetEquationAlt3(false)) + "\n");
    DumpVariables();
    EngineSays("ExprTree\n");
    if (m_store->root != kNone)
        DumpNode(m_store->nodes, m_store->root);
    EngineSays("\n");
    DumpList();
    GetTruthTable().Dbg();
    EngineSays("\n");
}

} // namespace reference
