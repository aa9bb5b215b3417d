// The tables of a cell: one for each output, from its parameters and pins.
#include <algorithm>
#include <cassert>

#include "cell_intake.h"
#include "read_fault.h"

namespace booleq {

namespace {

// Whether a value, in any spelling, is that number.
bool IsNumber(const CellValue& value, uint64_t number)
{
    if (value.isNumber)
        return value.number == number;
    uint64_t bits = 0;
    if (ReadPlainBits(value.text, bits) && bits == number)
        return true;
    InitDigits digits;
    const auto isRead = [&](BareDigits bare) {
        return ReadInitDigits(value.text, bare, 64, digits) && !digits.hasUnknown &&
               !digits.isLong && digits.words[0] == number;
    };
    return isRead(BareDigits::Decimal);
}

const uint64_t* UnknownOf(const InitDigits& digits)
{
    return digits.hasUnknown ? digits.unknown.data() : nullptr;
}

} // namespace

void CellIntake::EndVectorTable(const CellType& type, uint32_t designType)
{
    GatherVector(type);
    if (m_inputs.size() > kMaxTableInputs) {
        AddFinding(FindingCode::TooWide, "");
        EndUnreadOf(designType);
        return;
    }
    const auto numInputs = static_cast<unsigned int>(m_inputs.size());
    const CellValue* width = FindValue(type.widthParameter);
    m_digits.resize(std::max<size_t>(m_digits.size(), 1));
    if (width != nullptr) {
        if (!IsNumber(*width, numInputs))
            AddFinding(FindingCode::WidthMismatch, type.widthParameter);
    }
    if (!ReadParameter(type.parameters[0], 1u << numInputs, m_digits[0])) {
        EndUnreadOf(designType);
        return;
    }
    const InitId init = AddInit(numInputs, m_digits[0].words.data(), UnknownOf(m_digits[0]));
    PushTable(designType, 0, OutputNet(type.outputPins[0]), init);
    Count(designType);
}

bool CellIntake::IsMet(const CellCondition& condition) const
{
    const CellValue* value = FindValue(condition.parameter);
    if (value == nullptr)
        return condition.isInitial;
    if (!value->isNumber && value->text == condition.value)
        return true;
    InitDigits wanted;
    return ReadInitDigits(condition.value, BareDigits::Decimal, 64, wanted) &&
           IsNumber(*value, wanted.words[0]);
}

bool CellIntake::AreConditionsMet(const CellStep& step) const
{
    return std::all_of(step.conditions.begin(), step.conditions.end(),
                       [this](const CellCondition& condition) { return IsMet(condition); });
}

// The value of a parameter, in 'numBits' bits.  Fails: false, with a finding.
bool CellIntake::ReadParameter(const CellParameter& parameter, uint32_t numBits, InitDigits& digits)
{
    const CellValue* value = FindValue(parameter.name);
    if (value == nullptr) {
        ReadInitNumber(parameter.initial, numBits, digits);
        AddFinding(FindingCode::InitMissing, parameter.name);
        return true;
    }
    if (value->isNumber) {
        ReadInitNumber(value->number, numBits, digits);
    } else if (!ReadInitDigits(value->text, m_bare, numBits, digits) &&
               (parameter.form == BareDigits::ByFormat || parameter.form == m_bare ||
                !ReadInitDigits(value->text, parameter.form, numBits, digits))) {
        AddFinding(FindingCode::InitIllegible, parameter.name + "=" + Quoted(value->text));
        return false;
    }
    if (digits.isShort)
        AddFinding(FindingCode::InitShort, parameter.name + "=" + Quoted(value->text));
    if (digits.isLong)
        AddFinding(FindingCode::InitLong, parameter.name + "=" + Quoted(value->text));
    if (digits.hasUnknown)
        AddFinding(FindingCode::InitUnknown, parameter.name + "=" + Quoted(value->text));
    return true;
}

void CellIntake::EndTable(uint32_t cellType, uint32_t designType)
{
    const size_t numTables = m_module->tables.size();
    if (AddOutputs(cellType, designType)) {
        Count(designType);
        return;
    }
    RemoveTables(numTables);
    EndUnreadOf(designType);
}

// Adds the connected outputs; if none is connected, the first one that the parameters allow.
// Fails: false, with a finding.
bool CellIntake::AddOutputs(uint32_t cellType, uint32_t designType)
{
    const CellType& type = m_cell_types.All()[cellType];
    const ComposedTable* first = nullptr;
    bool isAny = false;
    for (const ComposedTable& output : m_outputs[cellType]) {
        if (!AreConditionsMet(output.Step()))
            continue;
        if (first == nullptr)
            first = &output;
        if (OutputNet(output.Step().name) == kNetOpen)
            continue;
        if (!AddOutput(type, output, designType))
            return false;
        isAny = true;
    }
    if (first == nullptr)
        AddFinding(FindingCode::ModeUnread, type.note);
    return first != nullptr && (isAny || AddOutput(type, *first, designType));
}

// Removes the tables of this cell; findings about them become findings about the cell.
void CellIntake::RemoveTables(size_t first)
{
    if (m_module->tables.size() == first)
        return;
    for (ReadFinding& finding : m_module->findings)
        if (finding.table != ReadFinding::kNoTable && finding.table >= first)
            finding.table = ReadFinding::kNoTable;
    m_module->inputs.resize(m_module->tables[first].firstInput);
    m_module->tables.resize(first);
    m_module->keys.resize(first);
}

// Fails: false, with a finding, if a parameter is not a number.
bool CellIntake::AddOutput(const CellType& type, const ComposedTable& output, uint32_t designType)
{
    m_digits.resize(std::max(m_digits.size(), type.parameters.size()));
    for (const uint32_t parameter : output.Parameters())
        if (!ReadParameter(type.parameters[parameter], type.parameters[parameter].numBits,
                           m_digits[parameter]))
            return false;
    m_inputs.clear();
    for (const uint32_t pin : output.Pins())
        m_inputs.push_back(InputNet(type.inputPins[pin], pin, type.isOpenZero));
    const bool hasUnknown = output.Tabulate(m_digits, m_words, m_unknown);
    const InitId init = AddInit(static_cast<unsigned int>(m_inputs.size()), m_words.data(),
                                hasUnknown ? m_unknown.data() : nullptr);
    const auto place =
        std::find(type.outputPins.begin(), type.outputPins.end(), output.Step().name);
    assert(place != type.outputPins.end());
    PushTable(designType, static_cast<size_t>(place - type.outputPins.begin()),
              OutputNet(output.Step().name), init);
    return true;
}

void CellIntake::PushTable(uint32_t designType, size_t outputPin, LocalNet output, InitId init)
{
    if (m_module->inputs.size() > UINT32_MAX - kMaxTableInputs)
        throw ReadFault{"more than 2^32 inputs of tables"};
    DesignTable table;
    table.isNamedByOutput = m_name == 0;
    table.name.name = m_name != 0 ? m_name : m_module->netNames[output];
    if (table.name.name == 0)
        table.name.name = NameOrLine();
    table.type = designType;
    table.init = init;
    table.firstInput = static_cast<uint32_t>(m_module->inputs.size());
    table.output = output;
    table.line = m_line;
    table.outputPin = static_cast<uint8_t>(outputPin);
    assert(m_inputs.size() == m_design.inits[init].numInputs);
    m_module->inputs.insert(m_module->inputs.end(), m_inputs.begin(), m_inputs.end());
    m_module->tables.push_back(table);
    m_module->keys.push_back(m_key);
    PlaceFindings(static_cast<uint32_t>(m_module->tables.size() - 1));
}

void CellIntake::EndWithRows(const Rows& rows, const std::vector<LocalNet>& inputs, LocalNet output)
{
    assert(rows.NumInputs() == inputs.size());
    KnownType& known = Known(m_type);
    if (known.designTypes.empty())
        known.designTypes.push_back(AddDesignType(m_type, CellRole::Table));
    m_inputs = inputs;
    PushTable(known.designTypes[0], 0, output, AddInit(rows.NumInputs(), rows.Words(), nullptr));
    Count(known.designTypes[0]);
}

void CellIntake::EndUnread(FindingCode code, const std::string& text)
{
    KnownType& known = Known(m_type);
    if (known.designTypes.empty())
        known.designTypes.push_back(AddDesignType(m_type, CellRole::Table));
    AddFinding(code, text);
    EndUnreadOf(known.designTypes[0]);
}

} // namespace booleq
