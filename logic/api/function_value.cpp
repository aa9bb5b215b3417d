// The function of the public headers: it shares a function of the rooms.
#include <kq_logic/function.h>

#include <set>
#include <utility>

#include "function_access.h"

namespace kq_logic {

Function::Function() : m_imp(std::make_shared<Imp>()) {}

bool Function::Set(const Kq_BoolEquation& equation)
{
    booleq::Function function;
    if (!booleq::FunctionOf(equation, function))
        return false;
    FunctionAccess::Set(std::move(function), *this);
    return true;
}

bool Function::Set(const std::vector<std::string>& inputs, const std::vector<uint64_t>& words)
{
    if (inputs.size() > kMaxFunctionInputs ||
        std::set<std::string>(inputs.begin(), inputs.end()).size() != inputs.size())
        return false;
    const auto numInputs = static_cast<unsigned int>(inputs.size());
    if (words.size() != booleq::NumWords(numInputs) ||
        (words.back() & ~booleq::RowMask(numInputs)) != 0)
        return false;
    FunctionAccess::Set({inputs, booleq::Rows(numInputs, words)}, *this);
    return true;
}

const std::vector<std::string>& Function::Inputs() const
{
    return m_imp->function.Inputs();
}

bool Function::At(uint64_t row) const
{
    return m_imp->function.At(row);
}

bool Function::DependsOn(size_t input) const
{
    return booleq::DependsOn(m_imp->function.GetRows(), static_cast<unsigned int>(input));
}

const uint64_t* Function::Words() const
{
    return m_imp->function.GetRows().Words();
}

size_t Function::NumWords() const
{
    return m_imp->function.GetRows().Size();
}

std::string Function::Hex() const
{
    return m_imp->function.Hex();
}

std::string Function::Binary() const
{
    return m_imp->function.Binary();
}

bool Function::operator==(const Function& other) const
{
    return m_imp == other.m_imp || m_imp->function == other.m_imp->function;
}

} // namespace kq_logic
