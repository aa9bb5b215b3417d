// The engine object: life, sharing of nodes, setting an equation, evaluation, dumps.
// Statics with a run-time initialiser stand here, in the order that they need.
// Fails: false or 0, with the object cleared when setting fails; std::bad_alloc.
#include <Kq_BoolEquationImp.h>

#include <new>
#include <string>
#include <unordered_map>

#include <port/Port_Env.h>
#include <port/Port_Init.h>
#include <port/mav_malloc.h>

#include "Kq_BoolEquationImpDiag.h"
#include "Kq_BoolEquationImpInitText.h"
#include "Kq_BoolEquationImpStore.h"
#include "Kq_BoolEquationImpWalk.h"

typedef Port::StringBase<char> String;
typedef Kq_BoolEquationImp::Node Node;

namespace {

// The host's services come first: everything below may use them.
Port::FileInit s_fileInit;
Port::PathListInit s_pathListInit;
Port_MsgManInit s_msgManInit;
InstanceTableInit s_instanceTableInit;
FactoryInit s_factoryInit;

// The pool of names, from load to unload. With it the texts of nodes are made, so that they
// outlive every equation, also one that is a static object elsewhere.
struct NamePool {
    NamePool()
    {
        const Node node;
        node.GetTypeName();
        node.GetTokenAlt1();
    }
    Kq_BoolEquationImp::StringMgr m_names;
};
NamePool s_namePool;

// Any value counts, an empty one too; read at load and never again.
bool s_internalDebugMode = Port_Env::GetEnv("MAV_KQ_BOOL_EQUATION_DEBUG") != nullptr;

} // namespace

std::allocator<Kq_BoolEquationImp> Kq_BoolEquationImp::m_kq_boolequationimp_mem;

Kq_BoolEquationImp::Kq_BoolEquationImp() : m_store(new Store) {}

Kq_BoolEquationImp::Kq_BoolEquationImp(const Kq_BoolEquationImp& other)
    : m_store(other.m_store), m_variables(other.m_variables)
{
    ++m_store->m_count;
}

Kq_BoolEquationImp::~Kq_BoolEquationImp()
{
    Store::Release(m_store);
}

Kq_BoolEquationImp& Kq_BoolEquationImp::operator=(const Kq_BoolEquationImp& other)
{
    std::vector<Variable> variables(other.m_variables);
    m_variables.swap(variables);
    // Counted before the old store is let go, so assignment among copies is harmless.
    ++other.m_store->m_count;
    Store* old = m_store;
    m_store = other.m_store;
    Store::Release(old);
    return *this;
}

void Kq_BoolEquationImp::Copy(const Kq_BoolEquationImp& other)
{
    *this = other;
}

void Kq_BoolEquationImp::Clear()
{
    if (m_store->m_count == 1) {
        m_store->Clear();
    } else {
        Store* fresh = new Store;
        Store::Release(m_store);
        m_store = fresh;
    }
    m_variables.clear();
}

bool Kq_BoolEquationImp::SetEquation(const String& text)
{
    if (KqInitText::IsCandidate(text)) {
        // Deliberate: what is no init value over these variables is read as an expression.
        std::unique_ptr<KqInitText> initText = KqInitText::Read(text, m_variables, false);
        if (initText) {
            Clear();
            return FinishInitValue(std::move(initText));
        }
    }
    // Read before anything is cleared: the text may be one of the names that go.
    Tokens tokens(text.length());
    const bool isRead = ScanTokens(text.c_str(), tokens);
    Clear();
    if (!isRead || tokens.GetSize() == 0)
        return false;
    return FinishEquation(tokens, nullptr);
}

// Makes an equation of the tokens: nodes, tree, variables, the init value's own root, pre-order.
// Requires: no nodes; listed inputs are defined.
bool Kq_BoolEquationImp::FinishEquation(const Tokens& tokens, const String* initValue)
{
    try {
        m_store->MakeNodes(tokens);
        BuildTree();
        if (!m_store->HasEquation())
            return false;
        // Variables are numbered in the order of the text, which pre-order need not be.
        DefineListedNames(tokens);
        if (initValue)
            m_store->AddTruthTableRoot(*initValue);
        m_store->ListInPreOrder();
        KqCheckStore(*m_store); // allocates, in the builds that check
    } catch (...) {
        Clear(); // rather than an equation that lacks some of its variables
        throw;
    }
    return true;
}

// Makes an equation of an init value. Its tree is owed, but where the way to it is output or only
// the expression counts.
// Requires: no nodes; either no variables or, as listed inputs, those of the value's names.
bool Kq_BoolEquationImp::FinishInitValue(std::unique_ptr<KqInitText> initText)
{
    try {
        if (initText->IsExact() && !GetInternalDebugMode()) {
            if (m_variables.empty()) {
                m_variables.reserve(initText->GetNumNames());
                for (const String& name : initText->GetNames())
                    m_variables.push_back(Variable(name, 0u));
            }
            m_store->Owe(std::move(initText));
            return true;
        }
        const std::string expression = initText->Expand();
        Tokens tokens(expression.length());
        if (ScanTokens(expression.c_str(), tokens))
            return FinishEquation(tokens, &initText->GetText());
    } catch (...) {
        Clear();
        throw;
    }
    Clear();
    return false;
}

unsigned int Kq_BoolEquationImp::Eval() const
{
    if (!GetInternalDebugMode())
        return m_store->Eval(m_variables);
    const Node* const root = m_store->GetRoot();
    if (!root)
        return 0;
    // Node by node, because the trace is output.
    const unsigned int value = root->Eval(m_variables);
    root->Dbg();
    return value;
}

bool Kq_BoolEquationImp::operator==(const Kq_BoolEquationImp& other) const
{
    // Deliberate: variables and values do not count.
    return m_store->IsSame(*other.m_store);
}

bool Kq_BoolEquationImp::operator!=(const Kq_BoolEquationImp& other) const
{
    return !(*this == other);
}

bool Kq_BoolEquationImp::operator!() const
{
    return !m_store->HasEquation();
}

Kq_BoolEquationImp::operator Kq_PtrTester*() const
{
    // Never dereferenced; any address that is not null will do.
    return m_store->HasEquation() ? reinterpret_cast<Kq_PtrTester*>(m_store) : nullptr;
}

bool Kq_BoolEquationImp::IsExpression() const
{
    return m_store->HasEquation() && !m_store->GetInitValue();
}

const Node* Kq_BoolEquationImp::GetRoot() const
{
    return m_store->GetRoot();
}

void* Kq_BoolEquationImp::operator new(size_t size)
{
    if (size == sizeof(Kq_BoolEquationImp))
        return m_kq_boolequationimp_mem.allocate(1);
    // Deliberate: the size of one engine object, whatever size was asked for.
    void* memory = mav_malloc(sizeof(Kq_BoolEquationImp));
    if (!memory)
        throw std::bad_alloc();
    return memory;
}

void Kq_BoolEquationImp::operator delete(void* memory, size_t size)
{
    if (size != sizeof(Kq_BoolEquationImp))
        mav_free(memory);
    else if (memory)
        m_kq_boolequationimp_mem.deallocate(static_cast<Kq_BoolEquationImp*>(memory), 1);
}

bool Kq_BoolEquationImp::GetInternalDebugMode()
{
    return s_internalDebugMode;
}

void Kq_BoolEquationImp::SetInternalDebugMode(bool on)
{
    s_internalDebugMode = on;
}

Kq_BoolEquationImp::StringMgr& Kq_BoolEquationImp::GetNamePool()
{
    return s_namePool.m_names;
}

// The dumps stand in this file because their messages carry its lines.
#define KQ_ENGINE_EMIT(...) KQ_EMIT(kKqEngineModule, __LINE__, __VA_ARGS__)

namespace {

typedef std::unordered_map<const Node*, int> Positions;

// A link that leads to no listed node prints like a null one.
void DumpReference(const Node* node, const Positions& positions)
{
    const auto position = positions.find(node);
    if (position != positions.end())
        KQ_ENGINE_EMIT(" [%03d]", position->second);
    else
        KQ_ENGINE_EMIT(" -----");
}

void DumpVariables(const std::vector<std::pair<String, unsigned int>>& variables)
{
    KQ_ENGINE_EMIT("NumVariables = %d\n", static_cast<int>(variables.size()));
    KQ_ENGINE_EMIT("\n");
    KQ_ENGINE_EMIT("  Id Name             Value\n");
    KQ_ENGINE_EMIT("  == ================ =====\n");
    // Deliberate: the Id is one more than the variable index.
    int id = 0;
    for (const auto& variable : variables)
        KQ_ENGINE_EMIT("  %2d %-16s %5d\n", ++id, variable.first.c_str(),
                       static_cast<int>(variable.second));
}

void DumpNodes(const std::vector<Node*>& nodes, const Node* root)
{
    Positions positions;
    for (const Node* node : nodes)
        positions.emplace(node, static_cast<int>(positions.size()));
    KQ_ENGINE_EMIT("NumNodes = %d\n", static_cast<int>(nodes.size()));
    KQ_ENGINE_EMIT("Root = ");
    DumpReference(root, positions);
    KQ_ENGINE_EMIT("\n");
    if (!nodes.empty()) {
        KQ_ENGINE_EMIT("\n");
        KQ_ENGINE_EMIT("     Id     Par  Left Right\n");
        KQ_ENGINE_EMIT("   =====   ===== ===== =====\n");
    }
    for (const Node* node : nodes) {
        KQ_ENGINE_EMIT("   [%03d] =", positions.at(node));
        DumpReference(node->GetParent(), positions);
        DumpReference(node->GetLeftChild(), positions);
        DumpReference(node->GetRightChild(), positions);
        KQ_ENGINE_EMIT(" %-12s", node->GetTypeName().c_str());
        KQ_ENGINE_EMIT(" %s", node->GetToken().c_str());
        KQ_ENGINE_EMIT("\n");
    }
}

} // namespace

void Kq_BoolEquationImp::Dbg() const
{
    KQ_ENGINE_EMIT("Bool Equation = %s\n", GetEquation(false).c_str());
    KQ_ENGINE_EMIT("Bool Equation Alt1 = %s\n", GetEquationAlt1(false).c_str());
    KQ_ENGINE_EMIT("Bool Equation Alt2 = %s\n", GetEquationAlt2(false).c_str());
    KQ_ENGINE_EMIT("Bool Equation Alt3 = %s\n", GetEquationAlt3(false).c_str());
    DumpVariables(std::vector<Variable>(m_variables));
    KQ_ENGINE_EMIT("\n");
    KQ_ENGINE_EMIT("ExprTree\n");
    if (m_store->HasEquation())
        m_store->GetRoot()->Dbg();
    KQ_ENGINE_EMIT("\n");
    DumpNodes(m_store->GetNodes(), m_store->GetRoot());
    KQ_ENGINE_EMIT("\n");
    GetTruthTable().Dbg();
    KQ_ENGINE_EMIT("\n");
}

void Kq_BoolEquationImp::TruthTable::Dbg() const
{
    KQ_ENGINE_EMIT("TruthTable\n");
    KQ_ENGINE_EMIT("  Eqn: \"%s\"\n", m_equation.c_str());
    const int numColumns = static_cast<int>(m_variable_names.size());
    KQ_ENGINE_EMIT("  NumCols: %d\n", numColumns);
    for (int column = 0; column < numColumns; ++column)
        KQ_ENGINE_EMIT("  Col[%d] = \"%s\"\n", column + 1,
                       m_variable_names[static_cast<size_t>(column)].c_str());
    KQ_ENGINE_EMIT("  NumRows: %d\n", static_cast<int>(m_rows.size()));
    if (!m_rows.empty()) {
        KQ_ENGINE_EMIT("   ");
        KQ_ENGINE_EMIT("   ");
        KQ_ENGINE_EMIT("  v");
        for (int column = 0; column < numColumns; ++column)
            KQ_ENGINE_EMIT(" %2d", column + 1);
        KQ_ENGINE_EMIT("\n");
        KQ_ENGINE_EMIT("   ");
        KQ_ENGINE_EMIT("   ");
        KQ_ENGINE_EMIT(" ==");
        for (int column = 0; column < numColumns; ++column)
            KQ_ENGINE_EMIT(" ==");
        KQ_ENGINE_EMIT("\n");
    }
    int number = 0;
    for (const Row& row : m_rows) {
        KQ_ENGINE_EMIT("   ");
        KQ_ENGINE_EMIT(" %2d", ++number);
        KQ_ENGINE_EMIT(" %2d", static_cast<int>(row.GetResultValue()));
        for (const unsigned int value : row.GetVariableValues())
            KQ_ENGINE_EMIT("  %d", static_cast<int>(value));
        KQ_ENGINE_EMIT("\n");
    }
}

void Kq_BoolEquationImp::TruthTable::Row::Dbg() const
{
    KQ_ENGINE_EMIT("    Row: %d=", static_cast<int>(m_result_value));
    for (const unsigned int value : m_variable_values)
        KQ_ENGINE_EMIT("%d", static_cast<int>(value));
    KQ_ENGINE_EMIT("\n");
}
