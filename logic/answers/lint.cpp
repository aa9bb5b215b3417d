#include "lint.h"

#include <algorithm>
#include <unordered_map>

#include "convert.h"
#include "foreign_text.h"
#include "function.h"
#include "lint_reason.h"
#include "notation_writer.h"
#include "text.h"

namespace booleq {

namespace {

constexpr size_t kMaxNamedInputs = 16;
constexpr double kMaxCauses = 16; // at least as many as lint_reason.h tries

std::string WithoutLineEnd(std::string text)
{
    if (!text.empty() && text.back() == '\n')
        text.pop_back();
    return text;
}

// Gives the names this library's numbers. A name that the notation does not tell apart from an
// earlier one becomes that one.
void Renumber(const Notation& notation, const std::vector<std::string>& names, ForeignTree& tree)
{
    std::unordered_map<std::string, uint32_t> numbers;
    for (size_t input = 0; input < names.size(); ++input)
        numbers.emplace(CanonicalName(notation, names[input]), static_cast<uint32_t>(input));
    for (ForeignTree::Node& node : tree.nodes)
        if (node.meaning == Meaning::Input)
            node.left = numbers.at(tree.names[node.left]);
    tree.names = names;
}

// This library's text for what the other notation reads; empty for a large function that operators
// on bits do not give.
std::string TextHere(const ForeignTree& tree, const WordFunction& function)
{
    Expression expression;
    return ToBits(tree, function, expression)
               ? WriteOwn(expression, OwnSyntax::First, Parentheses::Clear)
               : std::string();
}

ForeignReading ReadAs(const Notation& notation, const std::string& text,
                      const Expression& expression, const Limits& limits)
{
    ForeignReading reading;
    reading.notation = notation.name;
    ForeignTree tree;
    reading.isRead = Read(text, notation, tree, reading.fault);
    if (!reading.isRead)
        return reading;
    Renumber(notation, expression.names, tree);
    const Side foreign = SideOf(tree);
    reading.decision = DecideEqual(SideOf(expression), foreign, limits);
    if (expression.names.size() <= kMaxLintHexInputs)
        reading.hex = Tabulate(foreign.evaluate, expression.names).Hex();
    if (reading.decision.IsEqual())
        return reading;
    reading.grouping = WriteWhole(tree, expression.names);
    const Limits each = {limits.seconds / kMaxCauses};
    reading.reason = FindReason(expression, tree, [&](const ForeignTree& undone) {
        return DecideEqual(SideOf(expression), SideOf(undone), each).IsEqual();
    });
    reading.textThere = WithoutLineEnd(Convert(expression, TargetOf(notation), "", limits).text);
    reading.textHere = TextHere(tree, foreign.evaluate);
    return reading;
}

bool IsSameTree(const Expression& left, const Expression& right)
{
    return std::equal(left.nodes.begin(), left.nodes.end(), right.nodes.begin(), right.nodes.end(),
                      [](const Expression::Node& own, const Expression::Node& other) {
                          return own.op == other.op && own.left == other.left &&
                                 own.right == other.right;
                      });
}

// Looks for findings that concern this library alone.
class Linter {
  public:
    Linter(const std::string& text, const Kq_BoolEquation& equation, const Reading& reading,
           const Expression& expression, const Limits& limits, LintReport& report)
        : m_text(text), m_equation(equation), m_reading(reading), m_expression(expression),
          m_limits(limits), m_report(report)
    {
    }

    void Run()
    {
        if (IsInitValue(m_equation)) {
            CheckInitWidth();
        } else {
            CheckBlanks();
            CheckRenderings();
            CheckLeadingZero();
        }
        CheckInputList();
    }

  private:
    Finding& Add(const char* code, const std::string& message)
    {
        m_report.findings.push_back({code, message, {}});
        return m_report.findings.back();
    }

    bool ReadAgain(const std::string& text, Expression& again) const
    {
        Kq_BoolEquation equation;
        if (!SetFromText(equation, text, m_reading))
            return false;
        again = ToExpression(equation);
        return again.names == m_expression.names;
    }

    // The same tree, with parentheses wherever a reader could be in doubt.
    std::string ClearText() const
    {
        return WriteOwn(m_expression, OwnSyntax::AsTyped, Parentheses::Clear);
    }

    // "~ |" is an inversion and an operator, "~|" is one operator.
    void CheckBlanks()
    {
        constexpr size_t kMaxPlaces = 20;
        bool isQuoted = false;
        size_t numPlaces = 0;
        for (size_t start = 0; start < m_text.size() && numPlaces < kMaxPlaces; ++start) {
            if (m_text[start] == '\'')
                isQuoted = !isQuoted;
            if (isQuoted || (m_text[start] != '~' && m_text[start] != '!'))
                continue;
            const size_t next = m_text.find_first_not_of(" \t\n", start + 1);
            if (next == std::string::npos || next == start + 1 ||
                std::string("&*|+^@").find(m_text[next]) == std::string::npos)
                continue;
            ++numPlaces;
            CheckBlank(start, next);
        }
    }

    void CheckBlank(size_t start, size_t next)
    {
        const std::string operatorText = std::string(1, m_text[start]) + m_text[next];
        const std::string message = "the blank inside \"" + std::string(1, m_text[start]) + " " +
                                    m_text[next] + "\" at character " + std::to_string(start + 1) +
                                    " changes the meaning: \"" + operatorText +
                                    "\" is another operator";
        const std::string closed = m_text.substr(0, start + 1) + m_text.substr(next);
        Expression other;
        if (!ReadAgain(closed, other)) {
            Add("blank", message).details = {{"without it", "refused"}, {"write", ClearText()}};
            return;
        }
        const Decision decision = DecideEqual(m_expression, other, m_limits);
        if (decision.IsEqual())
            return;
        const bool isDifferent = decision.IsDifferent();
        Add("blank", message).details = {
            {!isDifferent          ? "not decided"
             : decision.isFirstRow ? "first at"
                                   : "differs at",
             isDifferent ? AssignmentText(m_expression.names, decision.assignment)
                         : decision.reason},
            {"with it", WriteOwn(m_expression, OwnSyntax::First, Parentheses::Whole)},
            {"without it", WriteOwn(other, OwnSyntax::First, Parentheses::Whole)},
            {"write", ClearText()}};
    }

    void CheckRenderings()
    {
        struct Rendering {
            const char* name;
            Port::StringBase<char> (Kq_BoolEquation::*get)(bool) const;
        };
        static constexpr Rendering kRenderings[] = {
            {"GetEquation", &Kq_BoolEquation::GetEquation},
            {"GetEquationAlt1", &Kq_BoolEquation::GetEquationAlt1},
            {"GetEquationAlt2", &Kq_BoolEquation::GetEquationAlt2},
            {"GetEquationAlt3", &Kq_BoolEquation::GetEquationAlt3}};
        for (const bool hasBlanks : {true, false}) {
            Finding finding = {hasBlanks ? "rendering" : "unspaced-rendering", "", {}};
            for (const Rendering& rendering : kRenderings) {
                const std::string text = ToStd((m_equation.*rendering.get)(hasBlanks));
                Expression again;
                if (!ReadAgain(text, again) ||
                    !(IsSameTree(again, m_expression) ||
                      DecideEqual(m_expression, again, m_limits).IsEqual()))
                    finding.details.emplace_back(rendering.name, text);
            }
            if (finding.details.empty())
                continue;
            finding.message = std::string("the library's rendering ") +
                              (hasBlanks ? "with" : "without") + " blanks does not read back";
            finding.details.emplace_back("write", ClearText());
            m_report.findings.push_back(finding);
        }
    }

    void CheckLeadingZero()
    {
        if (m_text.size() < 3 || m_text[0] != '0')
            return;
        Add("leading-zero", "over listed inputs a text that begins with \"0\" is read as an init "
                            "value and refused")
            .details = {{"write", "(" + m_text + ")"}};
    }

    void CheckInputList()
    {
        if (!m_reading.hasInputs)
            return;
        const InputCheck check = CheckInputs(m_reading.inputs);
        for (const std::string& name : check.illegal)
            Add("skipped-input", "the listed input " + name + " is not a name and is skipped");
        for (const std::string& name : check.repeated)
            Add("skipped-input", "the input " + name + " is listed twice and counts once");
        const size_t numListed = check.usable.size();
        if (m_expression.names.size() <= numListed)
            return;
        const std::vector<std::string> unlisted(
            m_expression.names.begin() + static_cast<long>(numListed), m_expression.names.end());
        Add("unlisted-input",
            "inputs not in --inputs follow the listed ones and widen the table: " +
                Join(unlisted, ", "));
    }

    // With every input at 1 it is the last row, which has no digit if any row has none.
    void CheckInitWidth()
    {
        const size_t numInputs = m_expression.names.size();
        const InitWidth width = WidthOfInit(ToStd(m_equation.GetEquation(false)));
        if (width.numRows == 0 || numInputs > kMaxFunctionInputs ||
            width.numRows >= uint64_t(1) << numInputs)
            return;
        std::vector<uint64_t> stack;
        const uint64_t last =
            EvaluateWord(m_expression, std::vector<uint64_t>(numInputs, 1), stack);
        Add("short-init", "the init value gives " + std::to_string(width.numRows) + " rows of " +
                              std::to_string(uint64_t(1) << numInputs) + "; the others read as " +
                              ((last & 1u) != 0 ? "1" : "0"));
    }

    const std::string& m_text;
    const Kq_BoolEquation& m_equation;
    const Reading& m_reading;
    const Expression& m_expression;
    const Limits& m_limits;
    LintReport& m_report;
};

} // namespace

bool LintReport::IsClean() const
{
    return findings.empty() &&
           std::all_of(readings.begin(), readings.end(), [](const ForeignReading& reading) {
               return !reading.isRead || reading.decision.IsEqual();
           });
}

LintReport Lint(const std::string& text, const Kq_BoolEquation& equation, const Reading& reading,
                const Limits& limits)
{
    LintReport report;
    const Expression expression = ToExpression(equation);
    report.inputs = expression.names;
    report.grouping = WriteOwn(expression, OwnSyntax::First, Parentheses::Whole);
    if (!IsInitValue(equation))
        for (const Notation* notation : ForeignNotations())
            report.readings.push_back(ReadAs(*notation, text, expression, limits));
    Linter(text, equation, reading, expression, limits, report).Run();
    return report;
}

std::string AssignmentText(const std::vector<std::string>& names, const std::vector<bool>& values)
{
    std::string text;
    const bool isShort = names.size() <= kMaxNamedInputs;
    for (size_t input = 0; input < names.size(); ++input)
        if (isShort || values[input])
            text += (text.empty() ? "" : " ") + names[input] + (values[input] ? "=1" : "=0");
    if (isShort)
        return text.empty() ? "no inputs" : text;
    return text.empty() ? "all inputs 0" : text + ", the others 0";
}

} // namespace booleq
