#include "table_findings.h"

#include <cassert>
#include <unordered_map>

#include "net_function.h"
#include "structure.h"
#include "table_functions.h"
#include "text.h"
#include "watch.h"

namespace booleq {

namespace {

constexpr uint64_t kWatchedTables = 1024;
constexpr size_t kNumReaderRules = static_cast<size_t>(FindingCode::NumFindingCodes);

// These follow the reader's rules, in this order.
enum TableRule { IdleInput, ConstantTable, WireTable, InverterTable, SameFunction };

Severity SeverityOf(FindingCode code)
{
    switch (code) {
    case FindingCode::Buffer:
    case FindingCode::ConstantNet:
        return Severity::Note;
    case FindingCode::InitShort:
    case FindingCode::InitLong:
    case FindingCode::InitUnknown:
    case FindingCode::InitIllegible:
    case FindingCode::WidthMismatch:
    case FindingCode::PinStrange:
    case FindingCode::PinTwice:
    case FindingCode::CoverMixed:
    case FindingCode::DriverTwice:
    case FindingCode::NameTwice:
    case FindingCode::PortStrange:
    case FindingCode::PortWidth:
        return Severity::Error;
    case FindingCode::InitMissing:
    case FindingCode::PinOpen:
    case FindingCode::PinUnknown:
    case FindingCode::TooWide:
    case FindingCode::ModeUnread:
    case FindingCode::ModuleUnused:
    case FindingCode::NumFindingCodes:
        break;
    }
    return Severity::Warning;
}

std::vector<FindingRule> MakeRules()
{
    std::vector<FindingRule> rules;
    for (size_t code = 0; code < kNumReaderRules; ++code) {
        const auto known = static_cast<FindingCode>(code);
        rules.push_back({CodeWord(known), SeverityOf(known), CodeSentence(known)});
    }
    rules.push_back({"idle-input", Severity::Warning, "an input has no effect"});
    rules.push_back({"constant-table", Severity::Warning, "the table is constant"});
    rules.push_back({"wire", Severity::Note, "the table only passes one of its nets"});
    rules.push_back({"inverter", Severity::Note, "the table only inverts one of its nets"});
    rules.push_back(
        {"same-function", Severity::Note, "another table is the same function of the same nets"});
    return rules;
}

// The pin or parameter concerned, followed by the code's sentence.
std::string SentenceOf(const ReadFinding& finding)
{
    if (finding.text.empty())
        return CodeSentence(finding.code);
    const bool isWhole =
        finding.code == FindingCode::Buffer || finding.code == FindingCode::ConstantNet;
    return isWhole ? finding.text : finding.text + ": " + CodeSentence(finding.code);
}

uint64_t Mix(uint64_t hash, uint64_t value)
{
    hash = (hash ^ value) * 0x9e3779b97f4a7c15u;
    return hash ^ hash >> 29;
}

uint64_t HashOf(const NetFunction& function)
{
    uint64_t hash = function.nets.size();
    for (const NetId net : function.nets)
        hash = Mix(hash, net);
    for (size_t word = 0; word < function.rows.Size(); ++word)
        hash = Mix(hash, function.rows.Words()[word]);
    return hash;
}

class Inspector {
  public:
    Inspector(const Design& design, const FindingTaker& take)
        : m_design(design), m_take(take), m_functions(design)
    {
    }

    uint64_t Run()
    {
        for (const ReadFinding& finding : m_design.findings) {
            if (m_is_over)
                break;
            Take(static_cast<size_t>(finding.code), finding.line, Path(m_design, finding.name),
                 SentenceOf(finding));
        }
        for (uint32_t table = 0; table < m_design.tables.size() && !m_is_over; ++table) {
            if (table % kWatchedTables == 0)
                Watch();
            Look(table);
        }
        return m_num_findings;
    }

  private:
    void Take(size_t rule, uint32_t line, const std::string& path, const std::string& text)
    {
        assert(rule < FindingRules().size());
        if (m_is_over)
            return;
        ++m_num_findings;
        m_is_over = !m_take({rule, line, path, text});
    }

    void TakeOf(uint32_t table, TableRule rule, const std::string& text)
    {
        const DesignTable& own = m_design.tables[table];
        Take(kNumReaderRules + rule, own.line, TableName(m_design, table), text);
    }

    void Look(uint32_t table)
    {
        m_functions.Find(m_design.tables[table], m_found);
        const Rows& rows = m_functions.Functions()[m_found.function];
        for (const NetId net : m_found.idle)
            TakeOf(table, IdleInput, "input " + NetName(m_design, net) + " has no effect");
        if (rows.NumInputs() == 0) {
            TakeOf(table, ConstantTable, rows.At(0) ? "always 1" : "always 0");
            return;
        }
        if (rows.NumInputs() == 1)
            TakeOf(table, rows.At(1) ? WireTable : InverterTable,
                   (rows.At(1) ? "only passes " : "only inverts ") +
                       NetName(m_design, m_found.nets[0]));
        LookForSame(table, {rows, m_found.nets});
    }

    // A table is compared with the first one that has the same hash. An equal table is missed only
    // if two different functions share a hash of 64 bits.
    void LookForSame(uint32_t table, PinFunction pins)
    {
        const NetFunction function = Normalise(std::move(pins));
        const auto added = m_firsts.emplace(HashOf(function), table);
        if (added.second || LeftFunction(m_design, added.first->second) != function)
            return;
        TakeOf(table, SameFunction,
               "the same function of the same nets as " + TableName(m_design, added.first->second));
    }

    const Design& m_design;
    const FindingTaker& m_take;
    TableFunctions m_functions;
    TableFunctions::Found m_found;
    std::unordered_map<uint64_t, uint32_t> m_firsts; // tables, by hash of their function
    uint64_t m_num_findings = 0;
    bool m_is_over = false;
};

} // namespace

const char* SeverityWord(Severity severity)
{
    switch (severity) {
    case Severity::Error:
        return "error";
    case Severity::Warning:
        return "warning";
    case Severity::Note:
        break;
    }
    return "note";
}

const std::vector<FindingRule>& FindingRules()
{
    static const std::vector<FindingRule> rules = MakeRules();
    return rules;
}

uint64_t FindFindings(const Design& design, const FindingTaker& take)
{
    return Inspector(design, take).Run();
}

} // namespace booleq
