// The command 'netlist diff': whether every look-up table of a netlist is still the same function.
#include <algorithm>

#include "cause_text.h"
#include "commands.h"
#include "comparison.h"
#include "lines.h"
#include "net_equations.h"
#include "netlist.h"
#include "options.h"
#include "progress.h"
#include "text.h"

namespace booleq {

namespace {

constexpr uint64_t kDefaultDescribed = 20;

// "0" or "1".
NetId ParseOpen(const Request& request)
{
    const std::string word = request.Get("--open");
    if (word != "0" && word != "1")
        throw UsageError("--open is 0 or 1, not '" + Visible(word) + "'");
    return word == "0" ? kNetZero : kNetOne;
}

// Lines of two names each; '#' begins a comment.
Renames ReadRenames(const std::string& file)
{
    Renames renames;
    LineReader reader(file);
    std::string line;
    for (size_t number = 1; reader.Next(line); ++number) {
        DropCarriageReturn(line);
        std::vector<std::string> words;
        for (size_t begin = line.find_first_not_of(" \t"); begin != std::string::npos;) {
            const size_t end = std::min(line.find_first_of(" \t", begin), line.size());
            words.push_back(line.substr(begin, end - begin));
            begin = line.find_first_not_of(" \t", end);
        }
        if (words.empty() || words[0][0] == '#')
            continue;
        if (words.size() != 2)
            throw UsageError(
                "--rename: " + Visible(file) + ":" + std::to_string(number) +
                ": a line has two names, one of the left netlist and one of the right, "
                "not " +
                Count(words.size(), "word"));
        renames.emplace_back(words[0], words[1]);
    }
    return renames;
}

NetNames ParseNames(const Request& request)
{
    const std::string word = request.Get("--names");
    if (!request.Has("--names") || word == "auto")
        return NetNames::Auto;
    if (word == "kept")
        return NetNames::Kept;
    if (word != "gone")
        throw UsageError("--names is auto, kept or gone, not '" + Visible(word) + "'");
    if (!request.Has("--key"))
        throw UsageError("--names gone leaves nothing to match tables by: give --key ATTRIBUTE");
    return NetNames::Gone;
}

void ShowTables(void* context, uint64_t numDone, uint64_t /*numTables*/)
{
    static_cast<Progress*>(context)->Show(numDone);
}

class DiffAnswer {
  public:
    DiffAnswer(const Request& request, Output& output, Design& left, Design& right,
               const CompareOptions& options)
        : m_request(request), m_output(output), m_left(left), m_right(right),
          m_comparison(left, right, options), m_equations(m_comparison),
          m_max_described(request.Has("--rows") ? ParseRows(request.Get("--rows"))
                                                : kDefaultDescribed)
    {
    }

    int Put()
    {
        for (const auto& rename : m_comparison.UnusedRenames())
            Complain(m_output, "warning: --rename: '" + Visible(rename.first) + " " +
                                   Visible(rename.second) +
                                   "' is not used: one of the nets does not exist, or already "
                                   "has a counterpart");
        WarnOfKey(m_left, m_request.operands[0]);
        WarnOfKey(m_right, m_request.operands[1]);
        if (m_comparison.Pairs().numKeysTwice > 0)
            Complain(m_output, "warning: " + Count(m_comparison.Pairs().numKeysTwice, "cell") +
                                   " of the right netlist with the key of another one");
        if (m_request.json)
            PutJsonAnswer();
        else
            PutText();
        return m_comparison.IsSame() ? kDone : kFindings;
    }

  private:
    void WarnOfKey(const Design& design, const std::string& file)
    {
        const auto hasNone = [](NameId key) { return key == 0; };
        if (m_request.Has("--key") && !design.tables.empty() &&
            std::all_of(design.keys.begin(), design.keys.end(), hasNone))
            Complain(m_output, "warning: --key: no table of " + Visible(file) +
                                   " has the attribute " + Visible(m_request.Get("--key")));
    }

    std::string EquationText(const NetFunction& function)
    {
        const std::string equation = m_equations.Of(function);
        return equation.empty() ? kNoExpression : Visible(equation);
    }

    Json EquationJson(const NetFunction& function)
    {
        const std::string equation = m_equations.Of(function);
        return equation.empty() ? Json(nullptr) : Json(equation);
    }

    void PutDifference(const TablePair& pair)
    {
        const Difference difference = m_comparison.Describe(pair);
        const NetId output = m_left.tables[pair.left].output;
        PutField(m_output, "different", Visible(TableName(m_left, pair.left)));
        PutField(m_output, "  net", Visible(NetName(m_left, output)));
        if (pair.by != PairedBy::Path)
            PutField(m_output, "  right",
                     Visible(TableName(m_right, pair.right)) + ", matched by " +
                         PairedWord(pair.by));
        if (!difference.isSameFunction) {
            std::string row;
            for (const auto& net : difference.assignment)
                row += (row.empty() ? "" : " ") + net.first + (net.second ? "=1" : "=0");
            PutField(m_output, "  first at",
                     Visible(row) + (row.empty() ? "" : ": ") + (difference.left ? "1" : "0") +
                         " and " + (difference.right ? "1" : "0"));
        }
        PutField(m_output, "  left is", EquationText(difference.leftFunction));
        PutField(m_output, "  right is", EquationText(difference.rightFunction));
        if (difference.causes.empty())
            PutField(m_output, "  cause", "none that is known");
        for (const Cause& cause : difference.causes)
            PutField(m_output, &cause == &difference.causes.front() ? "  cause" : "  or",
                     Visible(CauseText(m_comparison, cause)));
        if (!difference.expectedInit.empty() && !difference.isSameFunction)
            PutField(m_output, "  should be",
                     difference.expectedInit + ", right's pins being " + Visible(PinsText(pair)));
    }

    // The right table's pins, the most significant one first.
    std::string PinsText(const TablePair& pair) const
    {
        const DesignTable& table = m_right.tables[pair.right];
        std::vector<std::string> names;
        for (unsigned int pin = m_right.NumInputs(table); pin-- > 0;)
            names.push_back(NetName(m_right, m_right.Inputs(table)[pin]));
        return Join(names, ", ");
    }

    void PutLone(const char* label, const Design& design, uint32_t table)
    {
        const std::string wire = WireText(design, table);
        PutField(m_output, label,
                 Visible(TableName(design, table) + ", net " +
                         NetName(design, design.tables[table].output) +
                         (wire.empty() ? "" : ": " + wire)));
    }

    void PutText()
    {
        const std::vector<TablePair>& different = m_comparison.Different();
        for (size_t place = 0; place < different.size() && place < m_max_described; ++place)
            PutDifference(different[place]);
        if (different.size() > m_max_described)
            PutField(m_output, "different",
                     std::to_string(different.size() - m_max_described) +
                         " more; --rows all describes them");
        for (const uint32_t table : m_comparison.Pairs().onlyLeft)
            PutLone("missing", m_left, table);
        for (const uint32_t table : m_comparison.Pairs().onlyRight)
            PutLone("added", m_right, table);
        for (const RenamedNet& net : m_comparison.RenamedNets())
            PutField(m_output, "renamed",
                     Visible(NetName(m_left, net.left) + " is " + NetName(m_right, net.right)) +
                         " throughout, in " + Count(net.numTables, "table"));
        PutSummary();
    }

    void PutSummary()
    {
        const Pairing& pairing = m_comparison.Pairs();
        std::string counts = std::to_string(m_comparison.NumSame()) + " same, " +
                             std::to_string(m_comparison.Different().size()) + " different";
        if (m_comparison.NumRenamed() > 0)
            counts += ", " + std::to_string(m_comparison.NumRenamed()) + " the same but for names";
        counts += ", " + std::to_string(pairing.onlyLeft.size()) + " missing, " +
                  std::to_string(pairing.onlyRight.size()) + " added";
        PutField(m_output, m_comparison.IsSame() ? "same" : "not the same", counts);
        if (m_comparison.AreNamesGone())
            PutField(m_output, "",
                     "net names are ignored: " + std::to_string(m_comparison.Nets().NumKnown()) +
                         " nets are matched by the tables around them" +
                         (m_comparison.NumByOrder() == 0
                              ? ""
                              : "; " + Count(m_comparison.NumByOrder(), "table") +
                                    " compared up to the order of inputs"));
    }

    Json DifferenceJson(const TablePair& pair)
    {
        const Difference difference = m_comparison.Describe(pair);
        Json json;
        json["left"] = TableName(m_left, pair.left);
        json["right"] = TableName(m_right, pair.right);
        json["matched_by"] = PairedWord(pair.by);
        json["net"] = NetName(m_left, m_left.tables[pair.left].output);
        json["assignment"] = difference.isSameFunction ? Json(nullptr) : Json::object();
        for (const auto& net : difference.assignment)
            PutMember(json["assignment"], net.first, net.second ? 1 : 0);
        json["left_value"] =
            difference.isSameFunction ? Json(nullptr) : Json(difference.left ? 1 : 0);
        json["right_value"] =
            difference.isSameFunction ? Json(nullptr) : Json(difference.right ? 1 : 0);
        json["left_equation"] = EquationJson(difference.leftFunction);
        json["right_equation"] = EquationJson(difference.rightFunction);
        json["should_be"] =
            difference.expectedInit.empty() ? Json(nullptr) : Json(difference.expectedInit);
        json["causes"] = Json::array();
        for (const Cause& cause : difference.causes)
            json["causes"].push_back(
                {{"code", CauseWord(cause.code)}, {"message", CauseText(m_comparison, cause)}});
        return json;
    }

    Json LoneJson(const Design& design, uint32_t table) const
    {
        const std::string wire = WireText(design, table);
        return {{"path", TableName(design, table)},
                {"net", NetName(design, design.tables[table].output)},
                {"wire", wire.empty() ? Json(nullptr) : Json(wire)}};
    }

    void PutJsonAnswer()
    {
        const Pairing& pairing = m_comparison.Pairs();
        Json result;
        result["left"] = m_request.operands[0];
        result["right"] = m_request.operands[1];
        result["same"] = m_comparison.NumSame();
        result["same_but_for_names"] = m_comparison.NumRenamed();
        result["num_different"] = m_comparison.Different().size();
        result["names"] = m_comparison.AreNamesGone() ? "gone" : "kept";
        result["matched_nets"] = m_comparison.Nets().NumKnown();
        result["compared_by_order"] = m_comparison.NumByOrder();
        result["missing"] = Json::array();
        for (const uint32_t table : pairing.onlyLeft)
            result["missing"].push_back(LoneJson(m_left, table));
        result["added"] = Json::array();
        for (const uint32_t table : pairing.onlyRight)
            result["added"].push_back(LoneJson(m_right, table));
        result["renamed"] = Json::array();
        for (const RenamedNet& net : m_comparison.RenamedNets())
            result["renamed"].push_back({{"left", NetName(m_left, net.left)},
                                         {"right", NetName(m_right, net.right)},
                                         {"tables", net.numTables}});
        result["different"] = Json::array();
        const auto around = JsonAroundArray({m_request.operands[0], 0}, m_request,
                                            m_comparison.IsSame() ? "yes" : "no", result);
        m_output.Put(around.first);
        const std::vector<TablePair>& different = m_comparison.Different();
        const size_t numDescribed =
            m_request.Has("--rows")
                ? static_cast<size_t>(std::min<uint64_t>(different.size(), m_max_described))
                : different.size();
        for (size_t place = 0; place < numDescribed; ++place)
            m_output.Put((place > 0 ? "," : "") + JsonLine(DifferenceJson(different[place])));
        m_output.Put(around.second);
    }

    const Request& m_request;
    Output& m_output;
    const Design& m_left;
    const Design& m_right;
    Comparison m_comparison;
    NetEquations m_equations;
    uint64_t m_max_described;
};

int RunDiff(const Request& request, Output& output)
{
    CompareOptions options;
    options.names = ParseNames(request);
    options.followsWires = request.Has("--allow-wires");
    if (request.Has("--rows"))
        ParseRows(request.Get("--rows")); // wrong usage is reported before any work
    if (request.Has("--key") && request.Get("--key").empty())
        throw UsageError("--key needs the name of an attribute");
    if (request.Has("--open"))
        options.openInputs = ParseOpen(request);
    if (request.Has("--rename"))
        options.renames = ReadRenames(request.Get("--rename"));
    const CellTypes cellTypes = CellTypesOf(request);
    Design left;
    Design right;
    if (!ReadNetlists(request, cellTypes, request.Get("--key"), output, left, right))
        return kRefused;
    Progress progress("comparing", left.tables.size());
    options.progress = ShowTables;
    options.progressContext = &progress;
    return DiffAnswer(request, output, left, right, options).Put();
}

} // namespace

Command NetlistDiffCommand()
{
    std::vector<Option> options = {
        {"--key", "ATTRIBUTE", "Match by this attribute, such as a bel, where path and net do not"},
        {"--rename", "FILE",
         "Pairs of names, one pair a line: a net of LEFT and its name in RIGHT"},
        {"--names", "auto|kept|gone",
         "Whether equal net names mean the same net; gone: match by --key "
         "only (auto: decided from the pairs)"},
        {"--open", "0|1", "What an unconnected input reads"},
        {"--allow-wires", nullptr,
         "Accept tables that only pass a net or a constant and are in one netlist "
         "only; nets are followed through them"},
        {"--rows", "N|all", "Differences to describe (20; with --json all)"}};
    for (const Option& option : NetlistOptions())
        options.push_back(option);
    return {
        "netlist diff",
        "LEFT RIGHT",
        2,
        2,
        "Compare two netlists table by table: is each still the function it was?",
        "Tables are matched by path, else by output net, else by --key, and compared as functions\n"
        "of nets, whatever their pin order, width, cell type or format. For a table that differs\n"
        "it prints the first differing row by net names, both equations, and every cause that\n"
        "explains the whole difference, such as swapped pins with an unchanged init value,\n"
        "exchanged halves or shifted digits, with the init value that would have been right. If\n"
        "one side has lost its names, nets are matched by the tables around them. Status 0: same,\n"
        "1: different.\n",
        options,
        {"booleq netlist diff before.json after.json",
         "booleq netlist diff mapped.blif routed.json --rename nets.txt",
         "booleq netlist diff placed.json bitstream.json --key NEXTPNR_BEL --open 0"},
        RunDiff,
        true};
}

} // namespace booleq
