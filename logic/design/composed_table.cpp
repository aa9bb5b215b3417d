#include "composed_table.h"

#include <algorithm>
#include <cassert>

#include "rows.h"

namespace booleq {

namespace {

// Copies bits first to first + count - 1, as words.
void CopyBits(const std::vector<uint64_t>& source, uint64_t first, uint64_t count,
              std::vector<uint64_t>& target)
{
    assert(first + count <= source.size() * 64);
    target.assign(static_cast<size_t>((count + 63) / 64), 0);
    const auto offset = static_cast<size_t>(first / 64);
    const unsigned int shift = static_cast<unsigned int>(first % 64);
    for (size_t word = 0; word < target.size(); ++word) {
        target[word] = source[offset + word] >> shift;
        if (shift != 0 && offset + word + 1 < source.size())
            target[word] |= source[offset + word + 1] << (64 - shift);
    }
    if (count % 64 != 0)
        target.back() &= (uint64_t(1) << (count % 64)) - 1;
}

void SortUnique(std::vector<uint32_t>& values)
{
    std::sort(values.begin(), values.end());
    values.erase(std::unique(values.begin(), values.end()), values.end());
}

bool BitAt(const std::vector<uint64_t>& words, uint64_t bit)
{
    return (words[static_cast<size_t>(bit / 64)] >> (bit % 64) & 1u) != 0;
}

} // namespace

ComposedTable::ComposedTable(const CellType& type, size_t output)
    : m_type(type), m_output(output), m_is_used(type.steps.size(), false)
{
    assert(output < type.steps.size());
    assert(type.steps[output].isOutput);
    m_is_used[output] = true;
    const auto numPins = static_cast<uint32_t>(type.inputPins.size());
    bool hasSteps = false;
    for (size_t step = output + 1; step-- > 0;) {
        if (!m_is_used[step])
            continue;
        for (const uint32_t input : type.steps[step].inputs) {
            if (input < numPins) {
                m_pins.push_back(input);
                continue;
            }
            assert(input - numPins < step); // a step uses only steps before it
            m_is_used[input - numPins] = true;
            hasSteps = true;
        }
        if (type.steps[step].parameter != CellStep::kLiteral)
            m_parameters.push_back(type.steps[step].parameter);
    }
    SortUnique(m_parameters);
    m_is_plain = !hasSteps && !m_parameters.empty();
    if (m_is_plain)
        m_pins = type.steps[output].inputs; // in the order of the row number, not of the type
    else
        SortUnique(m_pins);
}

bool ComposedTable::EvaluateRow(const std::vector<InitDigits>& digits, uint64_t row,
                                bool& isUnknown) const
{
    std::vector<bool> values(m_type.inputPins.size() + m_output + 1, false);
    for (size_t place = 0; place < m_pins.size(); ++place)
        values[m_pins[place]] = (row >> place & 1u) != 0;
    for (size_t step = 0; step <= m_output; ++step) {
        if (!m_is_used[step])
            continue;
        const CellStep& own = m_type.steps[step];
        uint64_t bit = 0;
        for (size_t input = 0; input < own.inputs.size(); ++input)
            bit |= uint64_t(values[own.inputs[input]]) << input;
        bit += own.firstBit;
        const bool isLiteral = own.parameter == CellStep::kLiteral;
        values[m_type.inputPins.size() + step] =
            isLiteral ? (own.literal >> bit & 1u) != 0 : BitAt(digits[own.parameter].words, bit);
        isUnknown |= !isLiteral && BitAt(digits[own.parameter].unknown, bit);
    }
    return values.back();
}

bool ComposedTable::Tabulate(const std::vector<InitDigits>& digits, std::vector<uint64_t>& words,
                             std::vector<uint64_t>& unknown) const
{
    const CellStep& own = m_type.steps[m_output];
    const uint64_t numRows = uint64_t(1) << m_pins.size();
    if (m_is_plain) {
        CopyBits(digits[own.parameter].words, own.firstBit, numRows, words);
        if (digits[own.parameter].hasUnknown)
            CopyBits(digits[own.parameter].unknown, own.firstBit, numRows, unknown);
        return digits[own.parameter].hasUnknown &&
               std::any_of(unknown.begin(), unknown.end(), [](uint64_t word) { return word != 0; });
    }
    words.assign(NumWords(static_cast<unsigned int>(m_pins.size())), 0);
    unknown.assign(words.size(), 0);
    bool hasUnknown = false;
    for (uint64_t row = 0; row < numRows; ++row) {
        bool isUnknown = false;
        const bool value = EvaluateRow(digits, row, isUnknown);
        words[static_cast<size_t>(row / 64)] |= uint64_t(value && !isUnknown) << (row % 64);
        unknown[static_cast<size_t>(row / 64)] |= uint64_t(isUnknown) << (row % 64);
        hasUnknown |= isUnknown;
    }
    return hasUnknown;
}

} // namespace booleq
