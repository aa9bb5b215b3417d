// Text in, equation out: the object is cleared, everything is made apart from it, and at the end
// the object takes it whole.
// Fails: false with the object cleared; std::bad_alloc, or what a message's receiver throws, with
// the object cleared or as it was.
#include <Kq_BoolEquationImp.h>

#include <algorithm>
#include <cassert>
#include <cstring>
#include <string>

#include "Builder.h"
#include "Messages.h"
#include "NameIndex.h"
#include "Store.h"
#include "Terms.h"
#include "Tokens.h"

typedef Port::StringBase<char> String;
typedef Kq_BoolEquationImp::Node Node;
typedef KqVariable Variable;

namespace {

// Room made at an equation's first variable, so that ordinary tables never grow again.
constexpr size_t kFirstVariables = 8;

// Tells, after messages went out, whether the object still exists and still holds its store: a
// message's receiver may have set, cleared or destroyed it.
class Watch {
  public:
    Watch(const void* object, KqStore& store)
        : m_watcher{object, nullptr}, m_store(store), m_hold(store)
    {
        m_store.AddWatcher(m_watcher);
    }
    ~Watch() { m_store.RemoveWatcher(m_watcher); }
    Watch(const Watch&) = delete;
    Watch& operator=(const Watch&) = delete;

    bool IsUntouched() const { return m_store.HasHolder(m_watcher); }
    KqStore& GetStore() const { return m_store; }

  private:
    KqStore::Watcher m_watcher;
    KqStore& m_store;
    KqStoreHold m_hold; // so that clearing the object gives it another store
};

// Defines the name of every ID node that is not yet a variable, with value 0 and in text order, and
// writes its variable's index into every ID node.  Requires: nodes in the order of 'tokens'.
void DefineNames(const KqTokens& tokens, const std::vector<Node*>& nodes,
                 std::vector<Variable>& variables)
{
    KqNameIndex index(variables);
    Node* const* node = nodes.data();
    for (const KqTokens::Token& token : tokens) {
        Node* const idNode = *node++;
        if (token.type != Node::ID)
            continue;
        size_t variableIndex = index.Find(token.word->text, token.word->hash);
        if (variableIndex == kKqNotFound) {
            if (variables.capacity() == 0)
                variables.reserve(std::min<size_t>(tokens.GetSize(), kFirstVariables));
            variableIndex = variables.size();
            variables.push_back(Variable(token.word->text, 0u));
            index.Add(token.word->hash);
        }
        assert(idNode->IsId());
        assert(KqIsSameText(idNode->GetToken(), variables[variableIndex].first));
        idNode->SetValue(static_cast<unsigned int>(variableIndex));
    }
}

} // namespace

std::vector<Variable> KqListTerms(const std::vector<String>& terms, bool reverseTerms)
{
    std::vector<Variable> variables;
    variables.reserve(terms.size());
    KqNameIndex index(variables);
    for (size_t position = 0; position < terms.size(); ++position) {
        const String& name = terms[reverseTerms ? terms.size() - 1 - position : position];
        const uint64_t hash = KqHashText(name.c_str(), name.length());
        if (name.length() == 0 || !KqIsLegalName(name) || index.Find(name, hash) != kKqNotFound)
            continue;
        variables.push_back(Variable(name, 0u));
        index.Add(hash);
    }
    return variables;
}

bool Kq_BoolEquationImp::SetEquation(const String& text)
{
    if (KqDigits::IsCandidate(text)) {
        // Deliberate: what is not an init value over these variables is read as an expression.
        std::unique_ptr<KqDigits> digits = KqDigits::Read(text, m_variables, false);
        if (digits)
            return SetDigits(std::move(digits), std::vector<Variable>());
    }
    return SetExpression(text.c_str(), text.length(), std::vector<Variable>(), nullptr);
}

bool Kq_BoolEquationImp::SetEquationWithExplicitTerms(const std::vector<String>& terms,
                                                      const String& equation, bool termOrderFlag,
                                                      bool reverseTerms)
{
    if (!KqDigits::IsCandidate(equation))
        return SetExpression(equation.c_str(), equation.length(), KqListTerms(terms, false),
                             nullptr);
    // Deliberate: over listed inputs every text that starts with a 0 is an init value or refused,
    // "0&A" included.
    std::vector<Variable> inputs = KqListTerms(terms, reverseTerms);
    std::unique_ptr<KqDigits> digits = KqDigits::Read(equation, inputs, termOrderFlag);
    if (digits)
        return SetDigits(std::move(digits), std::move(inputs));
    Clear();
    return false;
}

// Sets an expression over the inputs and, after them, whatever else it names. When it is the
// expression of an init value, 'initValue' is the text that becomes its own root.
bool Kq_BoolEquationImp::SetExpression(const char* text, size_t length,
                                       std::vector<Variable> inputs, const String* initValue)
{
    // Read before anything is cleared: the text may be one of the names that are removed.
    KqTokens tokens(length);
    const bool isRead = KqScanTokens(text, GetNamePool(), tokens, nullptr);
    Clear();
    if (!isRead || tokens.GetSize() == 0)
        return false;
    const bool isTraced = KqDebugMode::IsOn();
    return isTraced ? BuildTraced(tokens, inputs, initValue)
                    : BuildSilently(tokens, inputs, initValue);
}

// Builds the equation from the tokens. Writes nothing except the dump of what is refused.
// Requires: a cleared object.
bool Kq_BoolEquationImp::BuildSilently(const KqTokens& tokens, std::vector<Variable>& inputs,
                                       const String* initValue)
{
    KqTree tree;
    m_store->LendList(tree.list);
    KqBuildResult result;
    try {
        tree.MakeNodes(tokens);
        result = KqBuildTree(tree.list, false);
        if (result.root) {
            TakeVariables(inputs);
            FinishTree(tokens, initValue, result.root, tree);
        }
    } catch (...) {
        m_variables.clear(); // rather than keep an equation that lacks some of its variables
        throw;
    }
    // The receiver may do anything to this object, which is not used after this.
    if (result.broken)
        result.broken->DbgFailure();
    return result.root != nullptr;
}

// The same, but the tree is written as it grows, to a receiver that may do anything to this object;
// what the receiver sets takes precedence.
bool Kq_BoolEquationImp::BuildTraced(const KqTokens& tokens, std::vector<Variable>& inputs,
                                     const String* initValue)
{
    KqTree tree;
    tree.MakeNodes(tokens);
    TakeVariables(inputs);
    KqBuildResult result;
    {
        Watch watch(this, *m_store);
        try {
            result = KqBuildTree(tree.list, true);
        } catch (...) {
            if (watch.IsUntouched())
                m_variables.clear();
            throw;
        }
        if (result.root && !watch.IsUntouched())
            return false;
        if (!result.root && watch.IsUntouched())
            m_variables.clear();
    }
    if (!result.root) {
        if (result.broken)
            result.broken->DbgFailure();
        return false;
    }
    try {
        if (m_store->IsShared() || !m_store->IsEmpty()) // a receiver has copied or used it
            ReplaceStore(new KqStore);
        FinishTree(tokens, initValue, result.root, tree);
    } catch (...) {
        m_variables.clear();
        throw;
    }
    return true;
}

// Takes the checked tree: defines variables, adds the init value's own root, lists in pre-order.
// Requires: nodes in the order of 'tokens'; inputs that are already variables; an empty store.
void Kq_BoolEquationImp::FinishTree(const KqTokens& tokens, const String* initValue, Node* root,
                                    KqTree& tree)
{
    tree.root = root;
    // Variables are numbered in text order, which pre-order need not be.
    DefineNames(tokens, tree.list, m_variables);
    if (initValue)
        tree.AddTruthTableRoot(*initValue);
    tree.ListInPreOrder();
    KqCheckTree(tree.root, tree.list);
    m_store->TakeTree(tree);
}

// Takes the list; a table that was once larger keeps its room.
void Kq_BoolEquationImp::TakeVariables(std::vector<Variable>& inputs)
{
    assert(m_variables.empty());
    if (inputs.capacity() >= m_variables.capacity()) {
        m_variables.swap(inputs);
        return;
    }
    try {
        m_variables.assign(inputs.begin(), inputs.end());
    } catch (...) {
        m_variables.clear();
        throw;
    }
}

// Sets an init value over 'inputs' or, when there are none, over its own names. Its tree is owed,
// except where the way to it is output or only the expression counts.
bool Kq_BoolEquationImp::SetDigits(std::unique_ptr<KqDigits> digits, std::vector<Variable> inputs)
{
    if (!digits->IsExact() || KqDebugMode::IsOn()) {
        const std::string expression = digits->Expand();
        return SetExpression(expression.c_str(), expression.length(), std::move(inputs),
                             &digits->GetText());
    }
    if (inputs.empty()) {
        inputs.reserve(digits->GetNumNames());
        for (const String& name : digits->GetNames())
            inputs.push_back(Variable(name, 0u));
    }
    Clear();
    TakeVariables(inputs);
    m_store->TakeDigits(std::move(digits));
    return true;
}

void Kq_BoolEquationImp::TokenizeNodes(const char* text)
{
    if (!text || !*text || !m_store->IsEmpty())
        return;
    KqTokens tokens(std::strlen(text));
    if (!KqScanTokens(text, GetNamePool(), tokens, nullptr))
        Clear();
    else if (tokens.GetSize() != 0)
        m_store->TakeTokens(tokens);
}

void Kq_BoolEquationImp::BuildTree()
{
    // Built from copies, because other objects may share the tokens, and a message's receiver may
    // do anything to this one.
    KqTree copy;
    m_store->CopyTokens(copy);
    if (copy.list.empty())
        return;
    Watch watch(this, *m_store);
    const KqBuildResult result = KqBuildTree(copy.list, true);
    if (result.root) {
        copy.root = result.root;
        watch.GetStore().TakeLinks(copy);
        return;
    }
    if (watch.IsUntouched())
        Clear();
    if (result.broken)
        result.broken->DbgFailure();
}
