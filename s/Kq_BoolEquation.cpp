// The classes that callers hold: each owns one engine object and forwards to it.
// Fails: as the engine does; constructors let std::bad_alloc pass.
#include <Kq_BoolEquation.h>

#include <Kq_BoolEquationImp.h>

#include "Messages.h"

typedef Port::StringBase<char> String;

// The handle dump is in this file because its messages carry this file's lines.
#define KQ_FACADE_EMIT(...) KQ_EMIT(kKqFacadeModule, __LINE__, __VA_ARGS__)

namespace {

// The value of a test that holds: only for a condition, never dereferenced, and deliberately not
// the address of anything.
Kq_PtrTester* TestResult(bool isTrue)
{
    return reinterpret_cast<Kq_PtrTester*>(static_cast<size_t>(isTrue ? 1 : 0));
}

} // namespace

struct Kq_BoolEquation::TruthTable::Imp {
    Kq_BoolEquationImp::TruthTable m_table;
};

struct Kq_BoolEquation::TruthTable::Row::Imp {
    Kq_BoolEquationImp::TruthTable::Row m_row;
};

Kq_BoolEquation::Kq_BoolEquation() : m_imp(new Kq_BoolEquationImp) {}

Kq_BoolEquation::Kq_BoolEquation(const String& equation) : Kq_BoolEquation()
{
    // A refused text still gives an object; operator! tells that it is empty.
    m_imp->SetEquation(equation);
}

Kq_BoolEquation::Kq_BoolEquation(const Kq_BoolEquation& other)
    : m_imp(new Kq_BoolEquationImp(*other.m_imp))
{
}

Kq_BoolEquation::~Kq_BoolEquation()
{
    delete m_imp;
    m_imp = nullptr;
}

Kq_BoolEquation& Kq_BoolEquation::operator=(const Kq_BoolEquation& other)
{
    *m_imp = *other.m_imp;
    return *this;
}

void Kq_BoolEquation::Copy(const Kq_BoolEquation& other)
{
    *m_imp = *other.m_imp;
}

void Kq_BoolEquation::SetEquationFromEquation(const Kq_BoolEquation& other)
{
    *m_imp = *other.m_imp;
}

void Kq_BoolEquation::Clear()
{
    m_imp->Clear();
}

bool Kq_BoolEquation::SetEquation(const String& equation)
{
    return m_imp->SetEquation(equation);
}

bool Kq_BoolEquation::SetEquationWithExplicitTerms(const std::vector<String>& terms,
                                                   const String& equation, bool termOrderFlag,
                                                   bool reverseTerms)
{
    return m_imp->SetEquationWithExplicitTerms(terms, equation, termOrderFlag, reverseTerms);
}

Kq_BoolEquation::Refusal Kq_BoolEquation::FindRefusal(const String& text,
                                                      const std::vector<String>* terms)
{
    return Kq_BoolEquationImp::FindRefusal(text, terms);
}

bool Kq_BoolEquation::IsExpression() const
{
    return m_imp->IsExpression();
}

bool Kq_BoolEquation::IsHexInitValue() const
{
    return m_imp->IsHexInitValue();
}

bool Kq_BoolEquation::IsBinaryInitValue() const
{
    return m_imp->IsBinaryInitValue();
}

String Kq_BoolEquation::GetEquation(bool spaces) const
{
    return m_imp->GetEquation(spaces);
}

String Kq_BoolEquation::GetEquationAlt1(bool spaces) const
{
    return m_imp->GetEquationAlt1(spaces);
}

String Kq_BoolEquation::GetEquationAlt2(bool spaces) const
{
    return m_imp->GetEquationAlt2(spaces);
}

String Kq_BoolEquation::GetEquationAlt3(bool spaces) const
{
    return m_imp->GetEquationAlt3(spaces);
}

String Kq_BoolEquation::GetEquationAsExpression(bool spaces) const
{
    return m_imp->GetEquationAsExpression(spaces);
}

String Kq_BoolEquation::GetEquationAsHexInitValue(bool upperCase) const
{
    return m_imp->GetEquationAsHexInitValue(upperCase);
}

String Kq_BoolEquation::GetEquationAsBinaryInitValue() const
{
    return m_imp->GetEquationAsBinaryInitValue();
}

String Kq_BoolEquation::GetInitValueTermEquation() const
{
    return m_imp->GetInitValueTermEquation();
}

bool Kq_BoolEquation::operator!() const
{
    return !*m_imp;
}

Kq_BoolEquation::operator Kq_PtrTester*() const
{
    return TestResult(!!*m_imp);
}

bool Kq_BoolEquation::operator==(const Kq_BoolEquation& other) const
{
    return *m_imp == *other.m_imp;
}

bool Kq_BoolEquation::operator!=(const Kq_BoolEquation& other) const
{
    return *m_imp != *other.m_imp;
}

unsigned int Kq_BoolEquation::Eval() const
{
    return m_imp->Eval();
}

bool Kq_BoolEquation::DefineVariable(const String& name, unsigned int value)
{
    return m_imp->DefineVariable(name, value);
}

bool Kq_BoolEquation::IsVariableDefined(const String& name) const
{
    return m_imp->IsVariableDefined(name);
}

bool Kq_BoolEquation::IsVariableDefined(const Handle& handle) const
{
    return m_imp->IsVariableDefined(handle);
}

bool Kq_BoolEquation::SetVariable(const String& name, unsigned int value)
{
    return m_imp->SetVariable(name, value);
}

bool Kq_BoolEquation::SetVariable(const Handle& handle, unsigned int value)
{
    return m_imp->SetVariable(handle, value);
}

unsigned int Kq_BoolEquation::GetVariable(const String& name) const
{
    return m_imp->GetVariable(name);
}

unsigned int Kq_BoolEquation::GetVariable(const Handle& handle) const
{
    return m_imp->GetVariable(handle);
}

Kq_BoolEquation::Handle Kq_BoolEquation::GetVariableHandle(const String& name) const
{
    return m_imp->GetVariableHandle(name);
}

unsigned int Kq_BoolEquation::GetNumVariables() const
{
    return m_imp->GetNumVariables();
}

const std::vector<std::pair<String, unsigned int>>& Kq_BoolEquation::GetVariables() const
{
    return m_imp->GetVariables();
}

Kq_BoolEquation::TruthTable Kq_BoolEquation::GetTruthTable() const
{
    return TruthTable(*this);
}

bool Kq_BoolEquation::GetColumn(std::vector<uint64_t>& words) const
{
    return m_imp->GetColumn(words);
}

bool Kq_BoolEquation::GetColumn(std::vector<uint64_t>& words, bool (*goOn)(void*),
                                void* context) const
{
    return m_imp->GetColumn(words, goOn, context);
}

const Kq_BoolEquationImp* Kq_BoolEquation::GetImp() const
{
    return m_imp;
}

void Kq_BoolEquation::Dbg() const
{
    m_imp->Dbg();
}

Kq_BoolEquation::Handle::Handle() = default;

Kq_BoolEquation::Handle::Handle(std::vector<unsigned int> values) : m_values(std::move(values)) {}

Kq_BoolEquation::Handle::Handle(const Handle& other) = default;

Kq_BoolEquation::Handle::~Handle() = default;

Kq_BoolEquation::Handle& Kq_BoolEquation::Handle::operator=(const Handle& other) = default;

bool Kq_BoolEquation::Handle::operator==(const Handle& other) const
{
    return m_values == other.m_values;
}

bool Kq_BoolEquation::Handle::operator!=(const Handle& other) const
{
    return !(*this == other);
}

void Kq_BoolEquation::Handle::Dbg() const
{
    const std::vector<unsigned int> held(m_values); // the receiver may change this handle
    KQ_FACADE_EMIT("Kq_BoolEquation::Handle::Dbg");
    KQ_FACADE_EMIT("Size = %d\n", static_cast<int>(held.size()));
    int entry = 0;
    for (const unsigned int value : held)
        KQ_FACADE_EMIT("Entry[%d] = %d\n", entry++, static_cast<int>(value));
}

Kq_BoolEquation::TruthTable::TruthTable() : m_imp(new Imp) {}

Kq_BoolEquation::TruthTable::TruthTable(const TruthTable& other) : m_imp(new Imp(*other.m_imp)) {}

Kq_BoolEquation::TruthTable::TruthTable(const Kq_BoolEquation& equation) : TruthTable()
{
    Build(equation);
}

Kq_BoolEquation::TruthTable::~TruthTable()
{
    delete m_imp;
    m_imp = nullptr;
}

Kq_BoolEquation::TruthTable& Kq_BoolEquation::TruthTable::operator=(const TruthTable& other)
{
    m_imp->m_table = other.m_imp->m_table;
    return *this;
}

Kq_BoolEquation::TruthTable& Kq_BoolEquation::TruthTable::operator=(const Kq_BoolEquation& equation)
{
    Build(equation);
    return *this;
}

void Kq_BoolEquation::TruthTable::Build(const Kq_BoolEquation& equation)
{
    m_imp->m_table.Build(*equation.m_imp);
}

bool Kq_BoolEquation::TruthTable::operator==(const TruthTable& other) const
{
    return other.m_imp->m_table == m_imp->m_table;
}

bool Kq_BoolEquation::TruthTable::operator!=(const TruthTable& other) const
{
    return !(*this == other);
}

bool Kq_BoolEquation::TruthTable::operator!() const
{
    return !m_imp->m_table;
}

Kq_BoolEquation::TruthTable::operator Kq_PtrTester*() const
{
    return TestResult(!!m_imp->m_table);
}

std::vector<String> Kq_BoolEquation::TruthTable::GetVariableNames() const
{
    return m_imp->m_table.GetVariableNames();
}

std::vector<Kq_BoolEquation::TruthTable::Row> Kq_BoolEquation::TruthTable::GetRows() const
{
    const std::vector<Kq_BoolEquationImp::TruthTable::Row>& rows = m_imp->m_table.GetRows();
    std::vector<Row> result;
    result.reserve(rows.size());
    for (const Kq_BoolEquationImp::TruthTable::Row& row : rows)
        result.emplace_back(row.GetResultValue(), row.GetVariableValues());
    return result;
}

void Kq_BoolEquation::TruthTable::Dbg() const
{
    m_imp->m_table.Dbg();
}

Kq_BoolEquation::TruthTable::Row::Row(unsigned int resultValue,
                                      const std::vector<unsigned int>& variableValues)
    : m_imp(new Imp{Kq_BoolEquationImp::TruthTable::Row(resultValue, variableValues)})
{
}

Kq_BoolEquation::TruthTable::Row::Row(const Row& other) : m_imp(new Imp(*other.m_imp)) {}

Kq_BoolEquation::TruthTable::Row::~Row()
{
    delete m_imp;
    m_imp = nullptr;
}

Kq_BoolEquation::TruthTable::Row& Kq_BoolEquation::TruthTable::Row::operator=(const Row& other)
{
    m_imp->m_row = other.m_imp->m_row;
    return *this;
}

bool Kq_BoolEquation::TruthTable::Row::operator==(const Row& other) const
{
    return other.m_imp->m_row == m_imp->m_row;
}

bool Kq_BoolEquation::TruthTable::Row::operator!=(const Row& other) const
{
    return !(*this == other);
}

unsigned int Kq_BoolEquation::TruthTable::Row::GetResultValue() const
{
    return m_imp->m_row.GetResultValue();
}

std::vector<unsigned int> Kq_BoolEquation::TruthTable::Row::GetVariableValues() const
{
    return m_imp->m_row.GetVariableValues();
}

void Kq_BoolEquation::TruthTable::Row::Dbg() const
{
    m_imp->m_row.Dbg();
}
