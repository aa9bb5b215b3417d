// The command 'netlist list': every look-up table, its nets, equation, name and init value.
#include <algorithm>
#include <cassert>

#include "commands.h"
#include "equation_text.h"
#include "fold.h"
#include "net_function.h"
#include "netlist.h"
#include "parallel.h"
#include "progress.h"
#include "table_functions.h"
#include "table_rows.h"
#include "text.h"

namespace booleq {

namespace {

constexpr const char* kDefaultTarget = "alt1";

enum class ListFormat { Text, Csv, JsonLines };

ListFormat ParseFormat(const Request& request)
{
    const std::string format = request.Get("--format");
    if (request.json && request.Has("--format"))
        throw UsageError("--json and --format " + Visible(format) +
                         " are two formats; give only one");
    if (request.json || format == "jsonl")
        return ListFormat::JsonLines;
    if (format == "csv")
        return ListFormat::Csv;
    if (format == "text" || !request.Has("--format"))
        return ListFormat::Text;
    throw UsageError("--format is text, csv or jsonl, not '" + Visible(format) + "'");
}

const Target& ParseTarget(const Request& request)
{
    const std::string word = request.Has("--to") ? request.Get("--to") : kDefaultTarget;
    std::vector<std::string> known;
    for (const Target& target : Targets()) {
        if (!WritesExpressions(target))
            continue;
        if (word == target.name)
            return target;
        known.push_back(target.name);
    }
    throw UsageError("--to takes one of " + Join(known, ", ") + ", not '" + Visible(word) + "'");
}

// '*' stands for any characters, '?' for one.  Cost: in step with the text times the stars.
bool MatchesGlob(const std::string& glob, const std::string& text)
{
    size_t place = 0;
    size_t star = std::string::npos;
    size_t afterStar = 0;
    for (size_t at = 0; at < text.size();) {
        if (place < glob.size() && glob[place] == '*') {
            star = place++;
            afterStar = at;
        } else if (place < glob.size() && (glob[place] == '?' || glob[place] == text[at])) {
            ++place;
            ++at;
        } else if (star != std::string::npos) {
            place = star + 1;
            at = ++afterStar;
        } else {
            return false;
        }
    }
    while (place < glob.size() && glob[place] == '*')
        ++place;
    return place == glob.size();
}

// What --cell and --net ask for.
class Filter {
  public:
    explicit Filter(const Request& request)
        : m_cell(request.Get("--cell")), m_net(request.Get("--net")),
          m_has_cell(request.Has("--cell")), m_has_net(request.Has("--net"))
    {
    }

    bool Takes(const Design& design, const DesignTable& table) const
    {
        if (m_has_cell && !MatchesGlob(m_cell, Path(design, table.name)))
            return false;
        if (!m_has_net || MatchesGlob(m_net, NetName(design, table.output)))
            return true;
        const NetId* const inputs = design.Inputs(table);
        return std::any_of(inputs, inputs + design.NumInputs(table),
                           [&](NetId net) { return MatchesGlob(m_net, NetName(design, net)); });
    }

  private:
    std::string m_cell;
    std::string m_net;
    bool m_has_cell;
    bool m_has_net;
};

// One table as it is printed.
struct ListedTable {
    std::string path;
    std::string type;
    std::string output;
    std::vector<std::string> pins; // nets, the most significant pin first
    std::string equation;          // empty when there is none
    std::string kind;
    std::string meaning;
    std::string init;    // with the first of 'pins' as the most significant
    std::string lsbInit; // with the first one as the least significant
};

class Lister {
  public:
    Lister(const Design& design, const Request& request, Output& output)
        : m_design(design), m_format(ParseFormat(request)), m_target(ParseTarget(request)),
          m_output(output), m_filter(request), m_functions(design), m_inits(design.inits.size())
    {
    }

    void Run()
    {
        PrepareTexts();
        if (m_format == ListFormat::Csv)
            m_output.Put("path,type,output,pins,equation,kind,function,init,lsb_first\n");
        Progress progress("tables", m_design.tables.size());
        for (uint32_t table = 0; table < m_design.tables.size(); ++table) {
            progress.Show(table);
            if (m_filter.Takes(m_design, m_design.tables[table]))
                Put(Describe(table));
        }
    }

  private:
    // The texts for the functions of the tables asked for, each made once, by all processors.
    void PrepareTexts()
    {
        std::vector<bool> isAsked;
        for (const DesignTable& table : m_design.tables) {
            if (!m_filter.Takes(m_design, table))
                continue;
            m_functions.Find(table, m_found);
            if (isAsked.size() <= m_found.function)
                isAsked.resize(m_found.function + 1, false);
            isAsked[m_found.function] = true;
        }
        m_texts.resize(m_functions.Functions().size());
        constexpr size_t kPart = 16; // about a millisecond
        RunInParts(m_texts.size(), kPart, LutWork(), [&](size_t begin, size_t end) {
            for (size_t function = begin; function < end; ++function)
                if (function < isAsked.size() && isAsked[function])
                    m_texts[function] = MakeTexts(m_functions.Functions()[function], m_target);
        });
    }

    ListedTable Describe(uint32_t table)
    {
        const DesignTable& own = m_design.tables[table];
        m_functions.Find(own, m_found);
        assert(m_found.function < m_texts.size());
        const FunctionTexts& texts = m_texts[m_found.function];
        ListedTable listed;
        listed.path = TableName(m_design, table);
        listed.type = m_design.names.Text(m_design.types[own.type].name);
        listed.output = NetName(m_design, own.output);
        const NetId* const pins = m_design.Inputs(own);
        for (unsigned int pin = m_design.NumInputs(own); pin-- > 0;)
            listed.pins.push_back(NetName(m_design, pins[pin]));
        std::vector<std::string> plain;
        std::vector<std::string> spelled;
        for (const NetId net : m_found.nets) {
            plain.push_back(NetName(m_design, net));
            spelled.push_back(SpellNet(m_design, net, m_target));
        }
        listed.equation = Fill(texts.equation, spelled);
        listed.kind = texts.kind;
        listed.meaning = Fill(texts.meaning, plain);
        FillInits(own.init, listed);
        return listed;
    }

    void FillInits(InitId init, ListedTable& listed)
    {
        std::pair<std::string, std::string>& known = m_inits[init];
        if (known.first.empty()) {
            const Rows rows = TableRows(m_design, m_design.inits[init]);
            known = {HexOf(rows), HexOf(ReverseInputs(rows))};
        }
        listed.init = known.first;
        listed.lsbInit = known.second;
    }

    void Put(const ListedTable& table)
    {
        switch (m_format) {
        case ListFormat::Text:
            PutText(table);
            break;
        case ListFormat::Csv:
            PutCsv(table);
            break;
        case ListFormat::JsonLines:
            PutJsonLine(table);
            break;
        }
    }

    void PutText(const ListedTable& table)
    {
        m_output.Put(Visible(table.path) + "  " + Visible(table.type) + "\n    " +
                     Visible(table.output) + " = " +
                     (table.equation.empty() ? kNoExpression : Visible(table.equation)) + "\n    " +
                     (table.kind.empty() ? "" : Visible(table.meaning) + "\n    ") + "init " +
                     table.init + ", " + table.lsbInit + " least first; pins " +
                     (table.pins.empty() ? "none" : Visible(Join(table.pins, ", "))) + "\n");
    }

    void PutCsv(const ListedTable& table)
    {
        std::string line;
        for (const std::string& field :
             {table.path, table.type, table.output, Join(table.pins, " "), table.equation,
              table.kind, table.meaning, table.init, table.lsbInit})
            line += (line.empty() ? "" : ",") + CsvField(field);
        m_output.Put(line + "\n");
    }

    void PutJsonLine(const ListedTable& table)
    {
        Json json;
        json["path"] = table.path;
        json["type"] = table.type;
        json["output"] = table.output;
        json["pins"] = table.pins;
        json["equation"] = table.equation.empty() ? Json(nullptr) : Json(table.equation);
        json["kind"] = table.kind.empty() ? Json(nullptr) : Json(table.kind);
        json["function"] = table.kind.empty() ? Json(nullptr) : Json(table.meaning);
        json["init"] = table.init;
        json["lsb_first"] = table.lsbInit;
        m_output.Put(JsonLine(json) + "\n");
    }

    const Design& m_design;
    ListFormat m_format;
    const Target& m_target;
    Output& m_output;
    Filter m_filter;
    TableFunctions m_functions;
    TableFunctions::Found m_found;
    std::vector<FunctionTexts> m_texts; // by function; empty for those not asked for
    std::vector<std::pair<std::string, std::string>> m_inits; // digits, by init value
};

int RunList(const Request& request, Output& output)
{
    ParseFormat(request); // wrong usage is reported before any work
    ParseTarget(request);
    const CellTypes cellTypes = CellTypesOf(request);
    Design design;
    if (!ReadNetlist(request.operands.front(), request, cellTypes, "", output, design))
        return kRefused;
    Lister(design, request, output).Run();
    return kDone;
}

} // namespace

Command NetlistListCommand()
{
    std::vector<Option> options = {
        {"--cell", "GLOB",
         "Only tables whose path matches; * stands for any characters, ? for one"},
        {"--net", "GLOB", "Only tables that drive or read a net whose name matches"},
        {"--to", "TARGET",
         "Notation of the equations: primary, alt1, alt2, alt3, paren, verilog, "
         "vhdl, c, python or liberty (alt1)"},
        {"--format", "text|csv|jsonl", "How to print them (text); --json is jsonl"}};
    for (const Option& option : NetlistOptions())
        options.push_back(option);
    return {
        "netlist list",
        "FILE",
        1,
        1,
        "List the look-up tables of a netlist with their equations over nets",
        "Prints for each table: path, type, output net, a short equation over its nets, the name\n"
        "of its function, and its init value with the first pin most and least significant.\n"
        "Equations leave out idle inputs and fold constant ones; each distinct function is\n"
        "shortened once and proved equal. If a notation cannot spell a net's name, the equation\n"
        "uses a changed name; the pins and the output keep the file's names.\n",
        options,
        {"booleq netlist list design.json --cell 'u1.*'",
         "booleq netlist list design.blif --net carry --to verilog",
         "booleq netlist list --format csv design.json"},
        RunList,
        true};
}

} // namespace booleq
