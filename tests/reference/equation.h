// The model's equation object: slow, obvious, and equal in every answer and every message.
// Nodes are never deleted or moved; the list order is a vector of node numbers.
#ifndef REFERENCE_EQUATION_H
#define REFERENCE_EQUATION_H

#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "reference/message.h"
#include "reference/node.h"

namespace reference {

// A variable index, then the list positions of the nodes with that name; empty: no such variable.
class Handle {
  public:
    Handle() {}
    explicit Handle(const std::vector<unsigned int>& values) : m_values(values) {}
    const unsigned int* begin() const { return m_values.data(); }
    const unsigned int* end() const { return m_values.data() + m_values.size(); }
    bool empty() const { return m_values.empty(); }
    size_t size() const { return m_values.size(); }
    bool operator==(const Handle& other) const { return m_values == other.m_values; }
    bool operator!=(const Handle& other) const { return m_values != other.m_values; }
    void Dbg() const;

  private:
    std::vector<unsigned int> m_values;
};

class Row {
  public:
    Row(unsigned int resultValue, const std::vector<unsigned int>& variableValues)
        : m_variable_values(variableValues), m_result_value(resultValue)
    {
    }
    unsigned int GetResultValue() const { return m_result_value; }
    const std::vector<unsigned int>& GetVariableValues() const { return m_variable_values; }
    bool operator==(const Row& other) const;
    bool operator!=(const Row& other) const { return !(*this == other); }
    void Dbg() const;

  private:
    std::vector<unsigned int> m_variable_values;
    unsigned int m_result_value;
};

class Equation;

class TruthTable {
  public:
    TruthTable() {}
    TruthTable(const Equation& equation) { Build(equation); }
    TruthTable& operator=(const Equation& equation);
    void Build(const Equation& equation);
    const std::vector<std::string>& GetVariableNames() const { return m_variable_names; }
    const std::vector<Row>& GetRows() const { return m_rows; }
    bool operator==(const TruthTable& other) const;
    bool operator!=(const TruthTable& other) const { return !(*this == other); }
    bool operator!() const { return m_variable_names.empty(); }
    void Dbg() const;

  private:
    std::vector<std::string> m_variable_names;
    std::vector<Row> m_rows;
    std::string m_equation;
};

// The nodes; copies of an equation share them.
struct Store {
    std::vector<Node> nodes;
    std::vector<int> list;
    int root = kNone;
};

class Equation {
  public:
    typedef std::pair<std::string, unsigned int> Variable;

    Equation() : m_store(std::make_shared<Store>()) {}

    void Clear();
    bool SetEquation(const std::string& text);
    bool SetEquationWithExplicitTerms(const std::vector<std::string>& terms,
                                      const std::string& equation, bool termOrderFlag,
                                      bool reverseTerms);
    void TokenizeNodes(const std::string& text);
    void BuildTree();

    unsigned int Eval() const;
    bool operator==(const Equation& other) const;
    bool operator!=(const Equation& other) const { return !(*this == other); }
    bool operator!() const { return m_store->root == kNone; }
    bool IsExpression() const;
    bool IsHexInitValue() const;
    bool IsBinaryInitValue() const;

    std::string GetEquation(bool spaces) const;
    std::string GetEquationAlt1(bool spaces) const { return RenderAlternative(1, spaces); }
    std::string GetEquationAlt2(bool spaces) const { return RenderAlternative(2, spaces); }
    std::string GetEquationAlt3(bool spaces) const { return RenderAlternative(3, spaces); }
    std::string GetEquationAsExpression(bool spaces) const;
    std::string GetEquationAsHexInitValue(bool upperCase) const;
    std::string GetEquationAsBinaryInitValue() const;
    std::string GetInitValueTermEquation() const;

    bool DefineVariable(const std::string& name, unsigned int value);
    bool IsVariableDefined(const std::string& name) const;
    bool IsVariableDefined(const Handle& handle) const;
    bool SetVariable(const std::string& name, unsigned int value);
    bool SetVariable(const Handle& handle, unsigned int value);
    unsigned int GetVariable(const std::string& name) const;
    unsigned int GetVariable(const Handle& handle) const;
    Handle GetVariableHandle(const std::string& name) const;
    unsigned int GetNumVariables() const { return static_cast<unsigned int>(m_variables.size()); }
    const std::vector<Variable>& GetVariables() const { return m_variables; }
    TruthTable GetTruthTable() const { return TruthTable(*this); }
    void Dbg() const;

    // For tests: the nodes as they are, and whether another equation shares them.
    const Store& GetStore() const { return *m_store; }
    bool IsShared() const { return m_store.use_count() > 1; }

  private:
    Node& At(int node) const { return m_store->nodes[static_cast<size_t>(node)]; }
    bool SetExpression(const std::string& text);
    void PutTruthTableOnTop(const std::string& initValue);
    void DefineListedNames();
    void ListInPreOrder();
    bool HasPrefix(char lower, char upper) const;
    std::string RenderAlternative(int syntax, bool spaces) const;
    std::vector<std::string> VariableNames() const;
    size_t FindVariable(const std::string& name) const;
    std::string NodeReference(int node) const;
    void DumpVariables() const;
    void DumpList() const;

    std::shared_ptr<Store> m_store;
    std::vector<Variable> m_variables;
};

// The tree below a root in pre-order, each link as a position in that order; kNone for no link.
struct FlatNode {
    int type;
    std::string token;
    int parent;
    int left;
    int right;
    unsigned int value;
};

std::vector<FlatNode> Flatten(const Store& store);

} // namespace reference

#endif
