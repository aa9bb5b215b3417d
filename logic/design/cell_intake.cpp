#include "cell_intake.h"

#include <algorithm>
#include <cassert>

#include "read_fault.h"

namespace booleq {

namespace {

constexpr uint32_t kNoType = UINT32_MAX;

bool IsAnyOf(const std::vector<std::string>& names, std::string_view name)
{
    return std::find(names.begin(), names.end(), name) != names.end();
}

} // namespace

bool TakeNumber(CellValue& value)
{
    for (const char character : value.text) {
        const auto digit = static_cast<uint64_t>(character - '0');
        if (character < '0' || character > '9' || value.number > (UINT64_MAX - digit) / 10)
            return false;
        value.number = value.number * 10 + digit;
    }
    return !value.text.empty();
}

CellIntake::CellIntake(Design& design, const CellTypes& cellTypes, BareDigits bare)
    : m_design(design), m_cell_types(cellTypes), m_bare(bare), m_inits(design),
      m_outputs(cellTypes.All().size())
{
    for (size_t type = 0; type < m_outputs.size(); ++type) {
        const CellType& own = cellTypes.All()[type];
        for (size_t step = 0; step < own.steps.size() && own.vectorPin.empty(); ++step)
            if (own.steps[step].isOutput)
                m_outputs[type].emplace_back(own, step);
    }
}

void CellIntake::Begin(NameId name, uint32_t line)
{
    assert(m_module != nullptr);
    m_name = name;
    m_line = line;
    m_key = 0;
    m_type = std::string_view();
    m_parameters.clear();
    m_pins.clear();
    m_bits.clear();
    m_findings.clear();
}

void CellIntake::AddParameter(std::string_view name, const CellValue& value)
{
    m_parameters.push_back({name, value});
}

void CellIntake::AddPin(std::string_view pin, const LocalNet* nets, size_t numNets)
{
    if (FindPin(pin, m_pins.size()) != nullptr) {
        AddFinding(FindingCode::PinTwice, std::string(pin));
        return;
    }
    m_pins.push_back({pin, static_cast<uint32_t>(m_bits.size()), static_cast<uint32_t>(numNets)});
    m_bits.insert(m_bits.end(), nets, nets + numNets);
}

CellIntake::KnownType& CellIntake::Known(std::string_view type)
{
    const NameId name = m_design.names.Add(type);
    const auto found = m_known.find(name);
    if (found != m_known.end())
        return found->second;
    KnownType& known = m_known[name];
    known.variants = m_cell_types.Find(std::string(type));
    if (known.variants != nullptr)
        known.designTypes.assign(known.variants->size(), kNoType);
    return known;
}

uint32_t CellIntake::AddDesignType(std::string_view name, CellRole role)
{
    DesignType type;
    type.name = m_design.names.Add(name);
    type.role = role;
    m_design.types.push_back(std::move(type));
    return static_cast<uint32_t>(m_design.types.size() - 1);
}

uint32_t CellIntake::DesignTypeOf(KnownType& known, size_t variant)
{
    uint32_t& designType = known.designTypes[variant];
    if (designType != kNoType)
        return designType;
    const CellType& type = m_cell_types.All()[(*known.variants)[variant]];
    // A constant has one type in the design, whatever its pin.
    for (size_t other = 0; type.kind == CellKind::Constant && other < known.designTypes.size();
         ++other)
        if (known.designTypes[other] != kNoType)
            return designType = known.designTypes[other];
    const CellRole role = type.kind == CellKind::Table      ? CellRole::Table
                          : type.kind == CellKind::Constant ? CellRole::Constant
                                                            : CellRole::Unread;
    designType = AddDesignType(type.name, role);
    DesignType& made = m_design.types.back();
    made.note = type.note;
    if (type.vectorPin.empty())
        made.inputPins = type.inputPins;
    made.outputPins = type.outputPins;
    return designType;
}

// Pins usually come in the order of the type, so the hint is usually right.
const CellIntake::Pin* CellIntake::FindPin(std::string_view name, size_t hint) const
{
    if (hint < m_pins.size() && m_pins[hint].name == name)
        return &m_pins[hint];
    for (const Pin& pin : m_pins)
        if (pin.name == name)
            return &pin;
    return nullptr;
}

const CellValue* CellIntake::FindValue(std::string_view name) const
{
    for (const Parameter& parameter : m_parameters)
        if (parameter.name == name)
            return &parameter.value;
    return nullptr;
}

bool CellIntake::HasAllPins(const CellType& type) const
{
    size_t bit = 0;
    return std::all_of(m_pins.begin(), m_pins.end(), [&](const Pin& pin) {
        return IsAnyOf(type.inputPins, pin.name) || IsAnyOf(type.outputPins, pin.name) ||
               IsAnyOf(type.otherPins, pin.name) || IsVectorBit(type, pin.name, bit);
    });
}

// Whether 'pin' is the vector pin A or a bit of it such as A[12].
bool CellIntake::IsVectorBit(const CellType& type, std::string_view pin, size_t& bit) const
{
    const std::string& vector = type.vectorPin;
    if (vector.empty() || pin.substr(0, vector.size()) != vector)
        return false;
    pin.remove_prefix(vector.size());
    if (pin.empty())
        return true;
    if (pin.size() < 3 || pin.size() > 8 || pin.front() != '[' || pin.back() != ']')
        return false;
    bit = 0;
    for (const char character : pin.substr(1, pin.size() - 2)) {
        if (character < '0' || character > '9')
            return false;
        bit = bit * 10 + static_cast<size_t>(character - '0');
    }
    return true;
}

void CellIntake::End()
{
    if (m_type.empty())
        throw ReadFault{"cell " + Quoted(m_design.names.Text(m_name)) + " has no type"};
    KnownType& known = Known(m_type);
    if (known.variants == nullptr) {
        EndPending();
        return;
    }
    for (size_t variant = 0; variant < known.variants->size(); ++variant) {
        const CellType& type = m_cell_types.All()[(*known.variants)[variant]];
        if (type.kind == CellKind::Unread) {
            EndUnreadOf(DesignTypeOf(known, variant));
            return;
        }
        if (!HasAllPins(type))
            continue;
        const uint32_t designType = DesignTypeOf(known, variant);
        if (type.kind == CellKind::Constant) {
            const LocalNet net = OutputNet(type.outputPins[0]);
            if (net >= kNumFixedNets)
                m_module->joins.emplace_back(type.value ? kNetOne : kNetZero, net);
            Count(designType);
        } else if (!type.vectorPin.empty()) {
            EndVectorTable(type, designType);
        } else {
            EndTable((*known.variants)[variant], designType);
        }
        return;
    }
    RefusePins(known);
}

// No variant of the type has all the pins. The one that has most of them shows which are strange.
void CellIntake::RefusePins(KnownType& known)
{
    size_t best = 0;
    size_t fewest = SIZE_MAX;
    const auto isStrange = [](const CellType& type, const Pin& pin) {
        return !IsAnyOf(type.inputPins, pin.name) && !IsAnyOf(type.outputPins, pin.name) &&
               !IsAnyOf(type.otherPins, pin.name);
    };
    for (size_t variant = 0; variant < known.variants->size(); ++variant) {
        const CellType& type = m_cell_types.All()[(*known.variants)[variant]];
        const auto numStrange = static_cast<size_t>(std::count_if(
            m_pins.begin(), m_pins.end(), [&](const Pin& pin) { return isStrange(type, pin); }));
        if (numStrange < fewest) {
            fewest = numStrange;
            best = variant;
        }
    }
    const CellType& type = m_cell_types.All()[(*known.variants)[best]];
    for (const Pin& pin : m_pins)
        if (isStrange(type, pin))
            AddFinding(FindingCode::PinStrange, std::string(pin.name));
    EndUnreadOf(DesignTypeOf(known, best));
}

LocalNet CellIntake::InputNet(const std::string& pin, size_t hint, bool isOpenZero)
{
    const Pin* found = FindPin(pin, hint);
    const LocalNet net = found == nullptr || found->count == 0 ? kNetOpen : m_bits[found->first];
    if (found != nullptr && found->count > 1)
        AddFinding(FindingCode::PortWidth, pin);
    if (net == kNetOpen && isOpenZero)
        return kNetZero;
    if (net == kNetOpen)
        AddFinding(FindingCode::PinOpen, pin);
    else if (net == kNetUnknown)
        AddFinding(FindingCode::PinUnknown, pin);
    return net;
}

LocalNet CellIntake::OutputNet(const std::string& pin)
{
    const Pin* found = FindPin(pin, m_pins.size());
    return found == nullptr || found->count == 0 ? kNetOpen : m_bits[found->first];
}

// The bits of the vector pin become m_inputs, whether the pin came whole or bit by bit.
void CellIntake::GatherVector(const CellType& type)
{
    m_inputs.clear();
    size_t bit = 0;
    for (const Pin& pin : m_pins) {
        if (pin.name == type.vectorPin) {
            m_inputs.assign(m_bits.begin() + pin.first, m_bits.begin() + pin.first + pin.count);
            continue;
        }
        if (!IsVectorBit(type, pin.name, bit) || pin.count == 0)
            continue;
        if (bit > kMaxTableInputs)
            bit = kMaxTableInputs; // too wide in any case
        if (m_inputs.size() <= bit)
            m_inputs.resize(bit + 1, kNetOpen);
        m_inputs[bit] = m_bits[pin.first];
    }
    for (size_t input = 0; input < m_inputs.size(); ++input) {
        if (m_inputs[input] != kNetOpen && m_inputs[input] != kNetUnknown)
            continue;
        AddFinding(m_inputs[input] == kNetOpen ? FindingCode::PinOpen : FindingCode::PinUnknown,
                   type.vectorPin + "[" + std::to_string(input) + "]");
    }
}

// A cell without a name is named after its line. (A table is named after its output.)
NameId CellIntake::NameOrLine()
{
    return m_name != 0 ? m_name : m_design.names.Add("$line" + std::to_string(m_line));
}

void CellIntake::EndUnreadOf(uint32_t designType)
{
    m_name = NameOrLine();
    m_module->unread.push_back({{0, m_name}, designType});
    PlaceFindings(ReadFinding::kNoTable);
    Count(designType);
}

void CellIntake::EndPending()
{
    PendingCell cell;
    cell.name = NameOrLine();
    cell.type = m_design.names.Add(m_type);
    cell.firstPin = static_cast<uint32_t>(m_module->pins.size());
    cell.numPins = static_cast<uint32_t>(m_pins.size());
    cell.line = m_line;
    for (const Pin& pin : m_pins) {
        if (m_module->bits.size() > UINT32_MAX - m_bits.size())
            throw ReadFault{"more than 2^32 connected pins"};
        m_module->pins.push_back({m_design.names.Add(pin.name),
                                  static_cast<uint32_t>(m_module->bits.size()), pin.count});
        m_module->bits.insert(m_module->bits.end(), m_bits.begin() + pin.first,
                              m_bits.begin() + pin.first + pin.count);
    }
    m_module->pending.push_back(cell);
    PlaceFindings(ReadFinding::kNoTable);
}

InitId CellIntake::AddInit(unsigned int numInputs, const uint64_t* words, const uint64_t* unknown)
{
    InitId init = 0;
    if (m_inits.Add(numInputs, words, unknown, init))
        return init;
    const std::string what = "with this table the different init values take more than " +
                             std::to_string(kMaxInitBytes >> 20) + " MB, a table of " +
                             booleq::Count(numInputs, "input") + " taking " +
                             std::to_string(NumWords(numInputs) * 8) +
                             " bytes; map the design to narrower tables, or give it in parts";
    if (m_line != 0)
        ThrowAtLine(m_line, what);
    throw ReadFault{"cell " + Quoted(m_design.names.Text(m_name)) + ": " + what};
}

void CellIntake::AddFinding(FindingCode code, const std::string& text)
{
    ReadFinding finding;
    finding.code = code;
    finding.line = m_line;
    finding.text = text;
    m_findings.push_back(std::move(finding));
}

// Attaches the findings of this cell to that table, or to the cell's name if it has no table.
void CellIntake::PlaceFindings(uint32_t table)
{
    for (ReadFinding& finding : m_findings) {
        finding.table = table;
        finding.name = {0, m_name};
        m_module->findings.push_back(std::move(finding));
    }
    m_findings.clear();
}

void CellIntake::Count(uint32_t designType)
{
    if (m_module->typeCounts.size() <= designType)
        m_module->typeCounts.resize(designType + size_t(1), 0);
    ++m_module->typeCounts[designType];
}

} // namespace booleq
