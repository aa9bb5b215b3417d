// The command 'netlist check': what is odd about look-up tables, one line for each finding.
#include <memory>

#include "commands.h"
#include "netlist.h"
#include "sarif.h"
#include "table_findings.h"
#include "text.h"

namespace booleq {

namespace {

std::string PlaceOf(const std::string& file, const TableFinding& finding)
{
    return Visible(file) + (finding.line > 0 ? ":" + std::to_string(finding.line) : "");
}

void PutLine(const std::string& file, const TableFinding& finding, Output& output)
{
    const FindingRule& rule = FindingRules()[finding.rule];
    output.Put(PlaceOf(file, finding) + ": " + SeverityWord(rule.severity) + ": " + rule.word +
               ": " + Visible(finding.path) + ": " + Visible(finding.text) + "\n");
}

Json ToJson(const TableFinding& finding)
{
    const FindingRule& rule = FindingRules()[finding.rule];
    return {{"code", rule.word},
            {"severity", SeverityWord(rule.severity)},
            {"path", finding.path},
            {"line", finding.line > 0 ? Json(finding.line) : Json(nullptr)},
            {"message", finding.text}};
}

std::vector<SarifRule> RulesForSarif()
{
    std::vector<SarifRule> rules;
    for (const FindingRule& rule : FindingRules())
        rules.push_back({rule.word, SeverityWord(rule.severity), rule.sentence});
    return rules;
}

// Writes each finding as soon as it is found: there may be very many.
class FindingsOut {
  public:
    FindingsOut(const std::string& file, const Request& request, Output& output)
        : m_file(file), m_request(request), m_output(output)
    {
        if (request.Has("--sarif"))
            m_sarif = std::make_unique<SarifFile>(request.Get("--sarif"), RulesForSarif());
    }

    uint64_t Put(const Design& design)
    {
        // The status comes before the findings, so whether there are any is asked first.
        std::pair<std::string, std::string> around;
        if (m_request.json) {
            around = AroundFindings(design);
            m_output.Put(around.first);
        }
        const uint64_t numFindings =
            FindFindings(design, [this](const TableFinding& finding) { return Take(finding); });
        m_output.Put(around.second);
        if (m_sarif)
            m_sarif->Finish();
        return numFindings;
    }

  private:
    std::pair<std::string, std::string> AroundFindings(const Design& design) const
    {
        const bool isClean = FindFindings(design, [](const TableFinding&) { return false; }) == 0;
        return JsonAroundArray({m_file, 0}, m_request, isClean ? "done" : "findings",
                               {{"tables", design.tables.size()}, {"findings", Json::array()}});
    }

    bool Take(const TableFinding& finding)
    {
        if (m_sarif)
            m_sarif->Put({finding.rule, finding.text, m_file, finding.line, finding.path});
        if (!m_request.json)
            PutLine(m_file, finding, m_output);
        else
            m_output.Put((m_num_taken > 0 ? "," : "") + JsonLine(ToJson(finding)));
        ++m_num_taken;
        return true;
    }

    const std::string& m_file;
    const Request& m_request;
    Output& m_output;
    std::unique_ptr<SarifFile> m_sarif;
    uint64_t m_num_taken = 0;
};

int RunNetlistCheck(const Request& request, Output& output)
{
    if (request.Get("--sarif") == "-")
        throw UsageError(
            "--sarif writes a file beside the lines on standard output: give its name");
    const CellTypes cellTypes = CellTypesOf(request);
    const std::string& file = request.operands.front();
    Design design;
    if (!ReadNetlist(file, request, cellTypes, "", output, design))
        return kRefused;
    const uint64_t numFindings = FindingsOut(file, request, output).Put(design);
    if (!request.json)
        output.Put((numFindings == 0 ? "no findings" : Count(numFindings, "finding")) + " in " +
                   Count(design.tables.size(), "table") + "\n");
    return numFindings == 0 ? kDone : kFindings;
}

} // namespace

Command NetlistCheckCommand()
{
    std::vector<Option> options = {
        {"--sarif", "FILE", "Also write the findings to FILE, as SARIF 2.1.0"}};
    for (const Option& option : NetlistOptions())
        options.push_back(option);
    return {
        "netlist check",
        "FILE",
        1,
        1,
        "Find faulty and suspicious look-up tables of a netlist",
        "Finds init values with too few, too many or x digits; inputs that have no effect or are\n"
        "not connected; tables that are constant, only pass or invert a net, or repeat another\n"
        "table's function of the same nets. Each finding is one line: file, line number if the\n"
        "format has lines, severity, code, path, explanation. Status 0: no findings, 1: "
        "findings.\n",
        options,
        {"booleq netlist check design.json",
         "booleq netlist check design.blif --sarif findings.sarif"},
        RunNetlistCheck,
        true};
}

} // namespace booleq
