#include "refusal.h"

#include <algorithm>
#include <cassert>
#include <cstring>

#include "foreign_spelling.h"
#include "function.h"
#include "init_literal.h"
#include "text.h"

namespace booleq {

namespace {

typedef Kq_BoolEquation::Refusal Refusal;

constexpr char kOperators[] = "&*|+^@";
constexpr char kWords[] = "the words are .AND. .OR. .XOR. .NOT. .NAND. .NOR. .NXOR.";

bool IsOneOf(const char* characters, char character)
{
    return character != '\0' && std::strchr(characters, character) != nullptr;
}

bool IsNamePart(char character)
{
    return (character >= 'A' && character <= 'Z') || (character >= 'a' && character <= 'z') ||
           (character >= '0' && character <= '9') || character == '_';
}

std::string Quoted(const std::string& text)
{
    return "'" + Excerpt(text) + "'";
}

// The refused text around the place of the refusal.
class Context {
  public:
    Context(const std::string& text, const Refusal& refusal) : m_text(text), m_refusal(refusal)
    {
        assert(refusal.offset <= text.size());
        assert(refusal.length <= text.size() - refusal.offset);
    }

    std::string Token() const { return m_text.substr(m_refusal.offset, m_refusal.length); }
    // The character 'distance' bytes after the start of the token; NUL outside the text.
    char At(size_t distance) const
    {
        const size_t position = m_refusal.offset + distance;
        return position < m_text.size() ? m_text[position] : '\0';
    }
    char Before() const { return m_refusal.offset > 0 ? m_text[m_refusal.offset - 1] : '\0'; }
    // The name that ends directly before the place.
    std::string NameBefore() const
    {
        size_t start = m_refusal.offset;
        while (start > 0 && IsNamePart(m_text[start - 1]))
            --start;
        return m_text.substr(start, m_refusal.offset - start);
    }
    // The operator character that blanks separate from a negation; NUL if there is none.
    char OperatorAfterNegation() const
    {
        const size_t next = m_text.find_first_not_of(" \t\n", m_refusal.offset + 1);
        const bool isSplit = next != std::string::npos && next > m_refusal.offset + 1;
        return isSplit && IsOneOf(kOperators, m_text[next]) ? m_text[next] : '\0';
    }
    // The name and everything after it up to a blank, an operator or a parenthesis: "A[0]", "3B".
    std::string WholeName() const
    {
        const std::string before = NameBefore();
        const size_t start = m_refusal.offset - before.size();
        size_t end = m_refusal.offset;
        while (end < m_text.size() && !IsOneOf(" \t\r\n&*|+^@~!()'", m_text[end]))
            ++end;
        return m_text.substr(start, end - start);
    }

  private:
    const std::string& m_text;
    const Refusal& m_refusal;
};

// The token's byte, with the bytes after it if they all make one character that can be shown.
std::string WholeCharacter(const Context& context)
{
    constexpr size_t kMaxBytes = 4;
    std::string character = context.Token();
    if (Visible(character) == character)
        return character;
    while (character.size() < kMaxBytes && (context.At(character.size()) & 0xc0) == 0x80)
        character += context.At(character.size());
    return Visible(character) == character ? character : context.Token();
}

void ExplainCharacter(const Context& context, RefusalReport& report)
{
    const char character = context.At(0);
    if (character == '\r') {
        report.reason = "a carriage return is not a blank";
        report.hint = "remove it (DOS line ends: tr -d '\\r')";
        return;
    }
    report.reason = Quoted(WholeCharacter(context)) + " is not part of the syntax";
    if (character >= '2' && character <= '9')
        report.reason = Quoted(context.Token()) +
                        " is not a constant (0 and 1 are), and no name begins with a digit";
    const std::string name = context.WholeName();
    const bool hasLetter = std::any_of(name.begin(), name.end(), IsNamePart);
    const bool isNumber = name.find_first_not_of("0123456789") == std::string::npos;
    if (isNumber && !name.empty())
        report.hint = "the only constants are 0 and 1; a name made of digits needs single quotes";
    else if (!hasLetter && IsPrintable(name))
        report.hint = "the operators are & | ^ ~ and ~& ~| ~^; a name with such a character needs "
                      "single quotes";
    else if (name.size() > 2 && name.front() == '"' && name.back() == '"' && IsPrintable(name))
        report.hint = "names are quoted with single quotes: '" +
                      Excerpt(name.substr(1, name.size() - 2)) + "'";
    else if (name.size() > 1 && IsPrintable(name))
        report.hint = "if " + Excerpt(name) + " is a name, write '" + Excerpt(name) + "'";
    else
        report.hint = "a name with such a character needs single quotes";
}

void ExplainWord(const Context& context, RefusalReport& report)
{
    const std::string word = context.Token();
    if (word.size() == 1) {
        report.reason = std::string("nothing closes this '.'; ") + kWords;
        report.hint = "a name with a '.' needs single quotes";
        return;
    }
    report.reason = Excerpt(word) + " is not an operator; " + kWords;
    std::string upper = word;
    std::transform(upper.begin(), upper.end(), upper.begin(), [](char character) {
        return character >= 'a' && character <= 'z' ? static_cast<char>(character - 32) : character;
    });
    if (upper == ".XNOR." || upper == ".NXOR.")
        report.hint = "write .NXOR.";
    else if (upper != word && std::strstr(kWords, upper.c_str()))
        report.hint = "write " + upper;
}

void ExplainOperand(const Context& context, const std::string& text, const Reading& reading,
                    RefusalReport& report)
{
    const std::string token = context.Token();
    report.reason = "expected an operator before " + Quoted(token);
    const bool looksLikeInit = text.size() > 2 && text[0] == '0' && IsOneOf("xXbB", text[1]) &&
                               report.offset == 1 && !reading.hasInputs;
    const char afterNegation = context.OperatorAfterNegation();
    if (looksLikeInit)
        report.hint = std::string("to give an init value, list its inputs with ") +
                      reading.inputsName + ", the most significant first";
    else if (IsOneOf("~!", token[0]) && afterNegation != '\0')
        report.hint = "write '" + token + afterNegation + "' without a blank in it";
    else if (token[0] == '\'' && !context.NameBefore().empty())
        report.hint = "write ~" + context.NameBefore() + " for not " + context.NameBefore();
    else
        report.hint = "put an operator before it, & or |";
}

void ExplainOperator(const Context& context, const char* side, RefusalReport& report)
{
    const std::string token = context.Token();
    report.reason = "the operator " + Quoted(token) + " has no operand on its " + side;
    if (token.size() == 1 && context.At(1) == token[0])
        report.hint = "write '" + token + "' instead of '" + token + token + "'";
}

void ExplainInitWidth(const std::string& text, const Reading& reading, RefusalReport& report)
{
    const InitWidth width = WidthOfInit(text);
    const size_t numGiven = CheckInputs(reading.inputs).usable.size();
    report.reason = std::to_string(text.size() - 2) + (width.isHex ? " hexadecimal" : " binary") +
                    (text.size() == 3 ? " digit needs" : " digits need") + " exactly " +
                    std::to_string(width.numInputs) +
                    (width.numInputs == 1 ? " input" : " inputs") + ", and " +
                    std::to_string(numGiven) + (numGiven == 1 ? " is listed" : " are listed");
    if (width.isHex && text.size() == 3 && numGiven == 1)
        report.hint = "one input has two rows: write 0x0 to 0x3, or two bits, 0b...";
}

void ExplainBuild(const Context& context, Refusal::CODE code, RefusalReport& report)
{
    switch (code) {
    case Refusal::PAREN:
        if (context.At(0) == '(') {
            report.reason = "nothing closes this '('";
            report.hint = "add a ')' after the group, or remove this '('";
        } else {
            report.reason = "no '(' matches this ')'";
            report.hint = "remove it, or add a '(' before the group";
        }
        return;
    case Refusal::NO_OPERAND:
        report.reason = "the negation " + Quoted(context.Token()) + " has no operand after it";
        return;
    case Refusal::NEGATED_OPERATOR:
        report.reason = "the negation " + Quoted(context.Token()) +
                        " comes before an operator and has no single operand before it";
        return;
    default:
        return;
    }
}

struct Named {
    Refusal::CODE code;
    const char* name;
};

const char* CodeName(Refusal::CODE code)
{
    static constexpr Named kNames[] = {
        {Refusal::EMPTY, "empty"},
        {Refusal::CHARACTER, "character"},
        {Refusal::WORD, "word"},
        {Refusal::QUOTE, "quote"},
        {Refusal::PAREN, "parenthesis"},
        {Refusal::OPERAND, "operand"},
        {Refusal::NO_LEFT_OPERAND, "no-left-operand"},
        {Refusal::NO_RIGHT_OPERAND, "no-right-operand"},
        {Refusal::NO_OPERAND, "no-operand"},
        {Refusal::NEGATED_OPERATOR, "negated-operator"},
        {Refusal::INIT_DIGIT, "init-digit"},
        {Refusal::INIT_WIDTH, "init-width"},
        {Refusal::INIT_NAME, "init-name"},
    };
    for (const Named& named : kNames)
        if (named.code == code)
            return named.name;
    return nullptr;
}

void ExplainCode(const std::string& text, const Reading& reading, const Refusal& refusal,
                 RefusalReport& report)
{
    const Context context(text, refusal);
    switch (refusal.code) {
    case Refusal::NONE:
        return;
    case Refusal::EMPTY:
        report.reason = "an empty equation";
        return;
    case Refusal::CHARACTER:
        return ExplainCharacter(context, report);
    case Refusal::WORD:
        return ExplainWord(context, report);
    case Refusal::QUOTE:
        report.reason = "nothing closes this quote";
        if (!context.NameBefore().empty())
            report.hint = "write ~" + context.NameBefore() + " for not " + context.NameBefore();
        else if (context.Before() == ')')
            report.hint = "write the negation of a group before it: ~( )";
        return;
    case Refusal::OPERAND:
        return ExplainOperand(context, text, reading, report);
    case Refusal::NO_LEFT_OPERAND:
        return ExplainOperator(context, "left", report);
    case Refusal::NO_RIGHT_OPERAND:
        return ExplainOperator(context, "right", report);
    case Refusal::PAREN:
    case Refusal::NO_OPERAND:
    case Refusal::NEGATED_OPERATOR:
        return ExplainBuild(context, refusal.code, report);
    case Refusal::INIT_DIGIT:
        if (refusal.offset == 1) {
            report.reason = "with listed inputs a text that begins with 0 is an init value, 0x... "
                            "or 0b...";
            report.hint = "put parentheses around an expression that begins with 0";
            return;
        }
        report.reason = Quoted(context.Token()) + " is not a " +
                        ((text[1] | 0x20) == 'x' ? "hexadecimal" : "binary") + " digit";
        return;
    case Refusal::INIT_WIDTH:
        return ExplainInitWidth(text, reading, report);
    case Refusal::INIT_NAME:
        report.reason = "an input's name goes on after its second quote; no init value can be "
                        "read over such a name";
        return;
    }
}

// Refusals that a spelling of another language may have caused.
bool MayBeForeign(Refusal::CODE code)
{
    return code == Refusal::CHARACTER || code == Refusal::WORD || code == Refusal::QUOTE ||
           code == Refusal::OPERAND;
}

// Whether the hint is an operator of this library.
bool IsCorrected(const RefusalReport& report)
{
    return report.hint.compare(0, 7, "write .") == 0;
}

// Explains a wrong sized init value over listed inputs, which never reaches the library.
bool ExplainLiteral(const std::string& text, const Reading& reading, RefusalReport& report)
{
    if (!reading.hasInputs || !IsSizedLiteral(text))
        return false;
    const InitLiteral literal = ReadInitLiteral(text, CheckInputs(reading.inputs).usable.size());
    if (!literal.code)
        return false;
    report.code = literal.code;
    report.offset = literal.offset;
    report.length = literal.length;
    report.reason = literal.reason;
    report.hint = literal.hint;
    return true;
}

} // namespace

RefusalReport ExplainRefusal(const std::string& text, const Reading& reading)
{
    RefusalReport report;
    // The library reads a NUL byte as the end of the text and would answer for what precedes it.
    const size_t nul = text.find('\0');
    if (nul != std::string::npos) {
        report.code = "nul-byte";
        report.offset = nul;
        report.length = 1;
        report.reason = "a NUL byte; this is not plain text";
        return report;
    }
    if (ExplainLiteral(text, reading, report))
        return report;
    std::vector<Port::StringBase<char>> terms;
    for (const std::string& input : reading.inputs)
        terms.push_back(input.c_str());
    const Refusal refusal =
        Kq_BoolEquation::FindRefusal(text.c_str(), reading.hasInputs ? &terms : nullptr);
    report.code = CodeName(refusal.code);
    report.offset = refusal.offset;
    report.length = refusal.length;
    ExplainCode(text, reading, refusal, report);
    assert((refusal.code == Refusal::NONE) == report.reason.empty());
    if (MayBeForeign(refusal.code)) {
        const std::string hint = HintForForeign(text, refusal.offset, reading);
        // If the library has the word between the dots in capital letters, it is not part of a
        // name.
        if (!hint.empty() && !(refusal.code == Refusal::WORD && IsCorrected(report)))
            report.hint = hint;
    }
    return report;
}

std::string MarkPlace(const std::string& text, size_t offset, size_t length,
                      const std::string& indent)
{
    assert(offset <= text.size());
    constexpr size_t kBefore = 40;
    constexpr size_t kShown = 60;
    const size_t lineFeed = offset == 0 ? std::string::npos : text.rfind('\n', offset - 1);
    const size_t lineStart = lineFeed == std::string::npos ? 0 : lineFeed + 1;
    const size_t lineEnd = std::min(text.find('\n', offset), text.size());
    const size_t start = std::max(lineStart, offset > kBefore ? offset - kBefore : 0);
    const size_t end = std::min(lineEnd, start + kShown);
    const std::string left = (start > lineStart ? "..." : "") +
                             Visible(text.substr(start, std::min(offset, end) - start));
    const size_t markEnd = std::max(offset, std::min(end, offset + length));
    const std::string marked = Visible(text.substr(offset, markEnd - offset));
    const std::string right = Visible(text.substr(markEnd, std::max(end, markEnd) - markEnd)) +
                              (end < lineEnd ? "..." : "");
    return indent + left + marked + right + "\n" + indent + std::string(Width(left), ' ') +
           std::string(std::max<size_t>(1, Width(marked)), '^') + "\n";
}

std::string PlaceName(const std::string& text, size_t offset)
{
    const auto lineFeeds = std::count(text.begin(), text.begin() + static_cast<long>(offset), '\n');
    const size_t lineFeed = offset == 0 ? std::string::npos : text.rfind('\n', offset - 1);
    const size_t column = lineFeed == std::string::npos ? offset : offset - lineFeed - 1;
    const std::string character = "character " + std::to_string(column + 1);
    return text.find('\n') == std::string::npos
               ? character
               : "line " + std::to_string(lineFeeds + 1) + ", " + character;
}

} // namespace booleq
