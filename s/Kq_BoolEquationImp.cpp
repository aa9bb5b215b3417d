// The engine object: life, sharing of nodes, evaluation, renderings, dumps.
// Statics with a run-time initialiser are defined here, in the order that they need.
// Fails: false or 0; std::bad_alloc.
#include <Kq_BoolEquationImp.h>

#include <cstring>
#include <new>

#include <port/Port_Env.h>
#include <port/Port_Init.h>
#include <port/mav_malloc.h>

#include "Column.h"
#include "Messages.h"
#include "NamePool.h"
#include "Render.h"
#include "Spelling.h"
#include "Store.h"

typedef Port::StringBase<char> String;
typedef Kq_BoolEquationImp::Node Node;

namespace {

// The host's services come first: everything below may use them.
Port::FileInit s_fileInit;
Port::PathListInit s_pathListInit;
Port_MsgManInit s_msgManInit;
InstanceTableInit s_instanceTableInit;
FactoryInit s_factoryInit;

// The pool of names, from load to unload. The spellings of nodes are made with it, so that they
// outlive every equation, even one that is a static object elsewhere.
struct NamePool {
    NamePool() { KqGetSpelling(0); }
    Kq_BoolEquationImp::StringMgr m_names;
};
NamePool s_namePool;

} // namespace

// Any value counts, even an empty one; read at load and never again.
std::atomic<bool> KqDebugMode::s_isOn{Port_Env::GetEnv("MAV_KQ_BOOL_EQUATION_DEBUG") != nullptr};

// Chosen now, so that the environment is read at load and never again.
[[maybe_unused]] static const KqNamedKernel& s_kernel = KqGetKernel();

std::allocator<Kq_BoolEquationImp> Kq_BoolEquationImp::m_kq_boolequationimp_mem;

Kq_BoolEquationImp::Kq_BoolEquationImp() : m_store(new KqStore) {}

Kq_BoolEquationImp::Kq_BoolEquationImp(const Kq_BoolEquationImp& other)
    : m_store(other.m_store), m_variables(other.m_variables)
{
    m_store->Hold();
}

Kq_BoolEquationImp::~Kq_BoolEquationImp()
{
    ReplaceStore(nullptr);
}

// Lets the old store go and tells its watchers.
void Kq_BoolEquationImp::ReplaceStore(KqStore* fresh) noexcept
{
    KqStore* const old = m_store;
    m_store = fresh;
    old->TellWatchers(this);
    KqStore::Release(old);
}

Kq_BoolEquationImp& Kq_BoolEquationImp::operator=(const Kq_BoolEquationImp& other)
{
    if (this == &other)
        return *this;
    std::vector<Variable> variables(other.m_variables);
    m_variables.swap(variables);
    // Held before the old store is let go, so assignment among copies is harmless.
    other.m_store->Hold();
    ReplaceStore(other.m_store);
    return *this;
}

void Kq_BoolEquationImp::Copy(const Kq_BoolEquationImp& other)
{
    *this = other;
}

void Kq_BoolEquationImp::Clear()
{
    if (m_store->IsShared())
        ReplaceStore(new KqStore);
    else
        m_store->Clear();
    m_variables.clear();
}

unsigned int Kq_BoolEquationImp::Eval() const
{
    if (!KqDebugMode::IsOn())
        return m_store->Eval(m_variables);
    // Node by node, because the trace is output. On a copy, because the receiver of the messages
    // may set, clear or destroy this object.
    const Kq_BoolEquationImp held(*this);
    const Node* const root = held.GetRoot();
    if (!root)
        return 0;
    const unsigned int value = root->Eval(held.m_variables);
    if (KqDebugMode::IsOn())
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
    return KqDebugMode::IsOn();
}

void Kq_BoolEquationImp::SetInternalDebugMode(bool on)
{
    KqDebugMode::s_isOn.store(on, std::memory_order_relaxed);
}

struct Kq_BoolEquationImp::StringMgr::StringMgrNode : KqNamePool {};

Kq_BoolEquationImp::StringMgr::StringMgr() : m_root(new StringMgrNode) {}

Kq_BoolEquationImp::StringMgr::~StringMgr()
{
    cleanup(m_root);
}

void Kq_BoolEquationImp::StringMgr::cleanup(StringMgrNode* node)
{
    delete node;
}

const String& Kq_BoolEquationImp::StringMgr::find(const char* name)
{
    const char* const text = name ? name : "";
    return m_root->Find(text, std::strlen(text)).text;
}

KqNamePool& Kq_BoolEquationImp::GetNamePool()
{
    return *s_namePool.m_names.m_root;
}

String Kq_BoolEquationImp::GetEquation(bool spaces) const
{
    const String* const initValue = m_store->GetInitValue();
    return initValue ? *initValue : KqRender(m_store->GetRoot(), &Node::GetToken, spaces);
}

// Deliberate: for an init value, the fixed syntaxes show the expression that it stands for; the
// primary one shows the value as given.
const Node* Kq_BoolEquationImp::GetExpressionRoot() const
{
    const Node* const root = m_store->GetRoot();
    return root && root->GetType() == Node::TRUTH_TABLE ? root->GetLeftChild() : root;
}

String Kq_BoolEquationImp::GetEquationAlt1(bool spaces) const
{
    return KqRender(GetExpressionRoot(), &Node::GetTokenAlt1, spaces);
}

String Kq_BoolEquationImp::GetEquationAlt2(bool spaces) const
{
    return KqRender(GetExpressionRoot(), &Node::GetTokenAlt2, spaces);
}

String Kq_BoolEquationImp::GetEquationAlt3(bool spaces) const
{
    return KqRender(GetExpressionRoot(), &Node::GetTokenAlt3, spaces);
}

String Kq_BoolEquationImp::GetEquationAsExpression(bool spaces) const
{
    return IsExpression() ? GetEquation(spaces) : GetEquationAlt1(spaces);
}

// The dumps are in this file because their messages carry its lines.
#define KQ_ENGINE_EMIT(...) KQ_EMIT(kKqEngineModule, __LINE__, __VA_ARGS__)

namespace {

// A link that leads to no listed node prints like a null one.
void DumpReference(size_t position)
{
    if (position != KqStore::Place::kNowhere)
        KQ_ENGINE_EMIT(" [%03d]", static_cast<int>(position));
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

void DumpNodes(const KqStore& store)
{
    size_t root = 0;
    const std::vector<KqStore::Place> places = store.ListPlaces(root);
    KQ_ENGINE_EMIT("NumNodes = %d\n", static_cast<int>(places.size()));
    KQ_ENGINE_EMIT("Root = ");
    DumpReference(root);
    KQ_ENGINE_EMIT("\n");
    if (!places.empty()) {
        KQ_ENGINE_EMIT("\n");
        KQ_ENGINE_EMIT("     Id     Par  Left Right\n");
        KQ_ENGINE_EMIT("   =====   ===== ===== =====\n");
    }
    int position = 0;
    for (const KqStore::Place& place : places) {
        KQ_ENGINE_EMIT("   [%03d] =", position++);
        DumpReference(place.parent);
        DumpReference(place.left);
        DumpReference(place.right);
        KQ_ENGINE_EMIT(" %-12s", place.node->GetTypeName().c_str());
        KQ_ENGINE_EMIT(" %s", place.node->GetToken().c_str());
        KQ_ENGINE_EMIT("\n");
    }
}

} // namespace

// On a copy, because the receiver of the messages may set, clear or destroy this object.
void Kq_BoolEquationImp::Dbg() const
{
    const Kq_BoolEquationImp held(*this);
    KQ_ENGINE_EMIT("Bool Equation = %s\n", held.GetEquation(false).c_str());
    KQ_ENGINE_EMIT("Bool Equation Alt1 = %s\n", held.GetEquationAlt1(false).c_str());
    KQ_ENGINE_EMIT("Bool Equation Alt2 = %s\n", held.GetEquationAlt2(false).c_str());
    KQ_ENGINE_EMIT("Bool Equation Alt3 = %s\n", held.GetEquationAlt3(false).c_str());
    DumpVariables(held.m_variables);
    KQ_ENGINE_EMIT("\n");
    KQ_ENGINE_EMIT("ExprTree\n");
    if (held.GetRoot())
        held.GetRoot()->Dbg();
    KQ_ENGINE_EMIT("\n");
    DumpNodes(*held.m_store);
    KQ_ENGINE_EMIT("\n");
    held.GetTruthTable().Dbg();
    KQ_ENGINE_EMIT("\n");
}

void Kq_BoolEquationImp::TruthTable::Dbg() const
{
    const TruthTable held(*this);
    KQ_ENGINE_EMIT("TruthTable\n");
    KQ_ENGINE_EMIT("  Eqn: \"%s\"\n", held.m_equation.c_str());
    const int numColumns = static_cast<int>(held.m_variable_names.size());
    KQ_ENGINE_EMIT("  NumCols: %d\n", numColumns);
    for (int column = 0; column < numColumns; ++column)
        KQ_ENGINE_EMIT("  Col[%d] = \"%s\"\n", column + 1,
                       held.m_variable_names[static_cast<size_t>(column)].c_str());
    KQ_ENGINE_EMIT("  NumRows: %d\n", static_cast<int>(held.m_rows.size()));
    if (!held.m_rows.empty()) {
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
    for (const Row& row : held.m_rows) {
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
    const Row held(*this);
    KQ_ENGINE_EMIT("    Row: %d=", static_cast<int>(held.m_result_value));
    for (const unsigned int value : held.m_variable_values)
        KQ_ENGINE_EMIT("%d", static_cast<int>(value));
    KQ_ENGINE_EMIT("\n");
}
