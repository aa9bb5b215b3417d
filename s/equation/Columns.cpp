// The result column of an equation, packed and as the digits of an init value, and the equation
// that lists an init value's inputs.
// Fails: std::bad_alloc.  Cost: O(nodes * 2^n / 64) for the column, O(2^n) for the text.
#include <Kq_BoolEquationImp.h>

#include <algorithm>
#include <cassert>
#include <optional>

#include "Digits.h"
#include "DigitsText.h"
#include "Messages.h"
#include "Results.h"
#include "Store.h"

typedef Port::StringBase<char> String;

namespace {

// Words of the column that are turned into text at a time: 2^17 rows.
constexpr size_t kPieceWords = 2048;

// Packs the results of all rows, which were evaluated one by one.
std::vector<uint64_t> PackRows(const std::vector<Kq_BoolEquationImp::TruthTable::Row>& rows)
{
    std::vector<uint64_t> words((rows.size() + 63) / 64);
    for (size_t row = 0; row < rows.size(); ++row)
        words[row / 64] |= uint64_t(rows[row].GetResultValue() ? 1 : 0) << (row % 64);
    return words;
}

// Appends the column of more than six variables in pieces, from the highest row to the lowest.
void AppendColumn(KqResults results, KqDigitsText& digits)
{
    std::vector<uint64_t> words(std::min(kPieceWords, results.GetNumWords()));
    digits.Reserve(results.GetNumWords());
    for (size_t end = results.GetNumWords(); end > 0; end -= words.size()) {
        results.Fill(end - words.size(), words.size(), words.data());
        assert(end % words.size() == 0);
        digits.AppendWords(words.data(), words.size());
    }
}

// Appends the init value's digits; nothing when the equation has no truth table.
void AppendDigits(const Kq_BoolEquationImp& equation, const KqStore& store, KqDigitsText digits)
{
    const unsigned int numVariables = equation.GetNumVariables();
    if (!equation || numVariables == 0 || numVariables > kKqMaxColumnVariables)
        return;
    if (KqDebugMode::IsOn()) {
        // The table evaluates node by node, because in debug mode the trace is output.
        const std::vector<uint64_t> words = PackRows(equation.GetTruthTable().GetRows());
        if (numVariables <= 6)
            digits.AppendFewRows(words[0], numVariables);
        else
            digits.AppendWords(words.data(), words.size());
    } else if (numVariables <= 6) {
        digits.AppendFewRows(store.GetWord(numVariables), numVariables);
    } else {
        AppendColumn(KqResults(store, numVariables), digits);
    }
}

// Whether 'initValue', null for none, starts with a 0 and the given character in either case.
bool HasPrefix(const String* initValue, char lowerCase, char upperCase)
{
    return initValue && initValue->length() >= KqDigits::kPrefixLength &&
           initValue->c_str()[0] == '0' &&
           (initValue->c_str()[1] == lowerCase || initValue->c_str()[1] == upperCase);
}

} // namespace

bool Kq_BoolEquationImp::IsHexInitValue() const
{
    return HasPrefix(m_store->GetInitValue(), 'x', 'X');
}

bool Kq_BoolEquationImp::IsBinaryInitValue() const
{
    return HasPrefix(m_store->GetInitValue(), 'b', 'B');
}

String Kq_BoolEquationImp::GetEquationAsHexInitValue(bool upperCase) const
{
    String text = "0x";
    AppendDigits(*this, *m_store, KqDigitsText(KQ_HEXADECIMAL, upperCase, text));
    // Deliberate: without a truth table one digit 0 is written, for the constant 1 as well.
    if (text.length() == KqDigits::kPrefixLength)
        text += '0';
    return text;
}

String Kq_BoolEquationImp::GetEquationAsBinaryInitValue() const
{
    // Deliberate: without a truth table no digit is written, unlike in the hexadecimal form.
    String text = "0b";
    AppendDigits(*this, *m_store, KqDigitsText(KQ_BINARY, false, text));
    return text;
}

String Kq_BoolEquationImp::GetInitValueTermEquation() const
{
    String text;
    for (size_t index = m_variables.size(); index-- > 0;) {
        text += m_variables[index].first;
        if (index > 0)
            text += '+';
    }
    return text;
}

bool Kq_BoolEquationImp::GetColumn(std::vector<uint64_t>& words) const
{
    return GetColumn(words, nullptr, nullptr);
}

bool Kq_BoolEquationImp::GetColumn(std::vector<uint64_t>& words, bool (*goOn)(void*),
                                   void* context) const
{
    words.clear();
    const unsigned int numVariables = GetNumVariables();
    if (!m_store->HasEquation() || numVariables > kKqMaxColumnVariables)
        return false;
    // goOn may set, clear or destroy this object.
    KqStore& store = *m_store;
    std::optional<KqStoreHold> hold;
    if (goOn)
        hold.emplace(store);
    if (numVariables <= 6) {
        if (goOn && !goOn(context))
            return false;
        // The one word repeats the rows; the repetitions are cleared.
        const uint64_t rows = numVariables == 6 ? 0 : uint64_t(1) << (1u << numVariables);
        words.assign(1, store.GetWord(numVariables) & (rows - 1));
        return true;
    }
    KqResults results(store, numVariables);
    std::vector<uint64_t> filled(results.GetNumWords());
    const size_t numPieceWords = goOn ? results.GetNumPieceWords() : filled.size();
    assert(filled.size() % numPieceWords == 0);
    for (size_t first = 0; first < filled.size(); first += numPieceWords) {
        if (goOn && !goOn(context))
            return false;
        results.Fill(first, numPieceWords, filled.data() + first);
    }
    words.swap(filled);
    return true;
}
