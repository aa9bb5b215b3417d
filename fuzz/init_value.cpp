// The input is an init value over up to 10 names, set plainly or with explicit terms, then
// questions and changes in any order to the object and to copies made before and after. The digits
// are the results, so answers are compared with them; with up to 5 names the model is asked as
// well.
#include <algorithm>
#include <array>
#include <cstdint>

#include "fuzz/bytes.h"
#include "fuzz/target.h"
#include "reference/init_text.h"
#include "support/equation_compare.h"

namespace fuzz {

namespace {

typedef std::vector<std::string> Names;

const size_t kMaxNames = 10;
const size_t kMaxModelNames = 5;
const size_t kMaxVariables = 11;
const size_t kMaxActions = 40;
const size_t kNumObjects = 3;

const Names kNames = {"a", "B", "x1", "'q r'", "_", "'0x8'", "AND", "'.OR. '", "''", "'a'"};

enum Action {
    AskEval,
    AskHex,
    AskBinary,
    AskText,
    AskExpression,
    AskAlternative,
    AskTable,
    AskColumn,
    AskKind,
    AskVariables,
    AskEqual,
    AskReadBack,
    DoSetVariable,
    DoDefineVariable,
    DoCopy,
    DoClear,
    kNumActions
};

const char* const kActionNames[] = {
    "Eval",          "hex init value", "binary init value", "GetEquation",
    "as expression", "alternative",    "truth table",       "column",
    "kind",          "variables",      "equality",          "read back",
    "SetVariable",   "Define",         "copy from",         "Clear"};

struct Step {
    Action action;
    size_t object;
    size_t value; // chooses what the action needs: another object, a variable, a syntax
};

struct Case {
    std::string text;
    Names names;
    bool isExplicit;
    bool firstIsLowest;
    bool isReversed;
    std::vector<Step> steps;
};

size_t NumRows(size_t numNames)
{
    return size_t(1) << numNames;
}

// As many digits as the names need; now and then another number, or a sign that is not a digit.
std::string Digits(Bytes& bytes, bool isHex, size_t numRows)
{
    const std::string alphabet = isHex ? "0123456789abcdefABCDEF" : "01";
    size_t numDigits = isHex ? std::max<size_t>(numRows / 4, 1) : numRows;
    const size_t oddity = bytes.Next();
    if (oddity >= 0xe0)
        numDigits = numDigits * (oddity - 0xe0) / 16 + oddity % 2;
    else if (oddity >= 0xc0)
        numDigits -= numDigits * (oddity - 0xc0) / 64;
    const std::string pattern = bytes.Raw(numDigits);
    std::string digits;
    while (digits.size() < numDigits && !pattern.empty()) {
        // A short pattern repeats, shifted a little each time.
        const size_t turn = digits.size() / pattern.size();
        const char byte = pattern[(digits.size() + turn / 3) % pattern.size()];
        digits += alphabet[static_cast<unsigned char>(byte) % alphabet.size()];
    }
    digits.resize(numDigits, oddity % 2 != 0 ? '1' : '0');
    if (oddity >= 0xb0 && oddity < 0xb8 && !digits.empty())
        digits[oddity * 31 % digits.size()] = "g2 \t\xe4(:@"[oddity - 0xb0];
    return digits;
}

Case Read(const std::string& input)
{
    Bytes bytes(input);
    const size_t form = bytes.Next();
    Case given;
    given.isExplicit = form % 2 != 0;
    given.firstIsLowest = form / 2 % 2 != 0;
    given.isReversed = form / 4 % 2 != 0;
    const bool isHex = form / 8 % 2 != 0;
    const bool isUpper = form / 16 % 2 != 0;
    // Few names are more frequent: each further one takes twice the time.
    const size_t choice = bytes.Next();
    const size_t numNames = choice % (choice < 0xc0 ? kMaxModelNames + 1 : kMaxNames + 1);
    for (size_t count = 0; count < numNames; ++count)
        given.names.push_back(kNames[(form / 32 + count) % kNames.size()]);
    for (size_t numSteps = bytes.Below(kMaxActions); numSteps > 0; --numSteps) {
        const Action action = static_cast<Action>(bytes.Below(kNumActions));
        const size_t value = bytes.Next();
        given.steps.push_back(Step{action, value % kNumObjects, value / kNumObjects});
    }
    given.text = isHex ? (isUpper ? "0X" : "0x") : (isUpper ? "0B" : "0b");
    given.text += Digits(bytes, isHex, NumRows(numNames));
    return given;
}

// An object as it should be: empty, or an init value over its first variables.
struct Expected {
    bool isSet = false;
    std::string text;
    Names ownNames;
    bool firstIsLowest = false;
    Names names;
    std::vector<unsigned int> values;

    void Set(const std::string& newText, const Names& newNames, bool newFirstIsLowest)
    {
        isSet = true;
        text = newText;
        ownNames = newNames;
        names = newNames;
        firstIsLowest = newFirstIsLowest;
        values.assign(names.size(), 0);
    }
    std::vector<unsigned int> Column() const;
    unsigned int Eval() const;
    std::string Expression() const
    {
        return isSet ? reference::ReadInitValue(text, ownNames, firstIsLowest) : "";
    }
};

// The digits as bits, the highest row first.
std::string Bits(const std::string& text)
{
    const bool isHex = text[1] == 'x' || text[1] == 'X';
    std::string bits;
    for (const char digit : text.substr(2)) {
        const unsigned long value = std::stoul(std::string(1, digit), nullptr, isHex ? 16 : 2);
        for (unsigned int bit = isHex ? 4 : 1; bit-- > 0;)
            bits += (value >> bit & 1u) != 0 ? '1' : '0';
    }
    return bits;
}

// The result of each row over all variables; those beyond the init value's own change nothing.
// Rows beyond the digits: the rarer digit, one or zero, is listed, and rows that are not listed
// have the other.
std::vector<unsigned int> Expected::Column() const
{
    const size_t numOwn = ownNames.size();
    if (!isSet)
        return std::vector<unsigned int>(NumRows(names.size()), 0);
    const std::string bits = Bits(text);
    const auto numOnes = std::count(bits.begin(), bits.end(), '1');
    const auto numZeros = static_cast<std::ptrdiff_t>(bits.size()) - numOnes;
    const bool listsZeros = numOnes == 0 || (numZeros != 0 && numOnes >= numZeros);
    std::vector<unsigned int> column;
    for (size_t row = 0; row < NumRows(names.size()); ++row) {
        const size_t ownRow = row >> (names.size() - numOwn);
        size_t digit = firstIsLowest ? 0 : ownRow;
        for (size_t bit = 0; firstIsLowest && bit < numOwn; ++bit)
            digit |= (ownRow >> bit & 1u) << (numOwn - 1 - bit);
        const bool isOne = digit < bits.size() ? bits[bits.size() - 1 - digit] == '1' : listsZeros;
        column.push_back(isOne ? 1 : 0);
    }
    return column;
}

unsigned int Expected::Eval() const
{
    size_t row = 0;
    for (const unsigned int value : values)
        row = row * 2 + value;
    return Column()[row];
}

// Rewrites syntax 2, in which the expression of an init value is written, in another syntax.
std::string InSyntax(size_t syntax, const std::string& text)
{
    static const char* const kSpellings[3][2] = {{"&", "|"}, {"*", "+"}, {".AND.", ".OR."}};
    std::string result;
    bool isQuoted = false;
    for (const char sign : text) {
        isQuoted = isQuoted != (sign == '\'');
        if (isQuoted || (sign != '*' && sign != '+'))
            result += sign;
        else
            result += kSpellings[syntax][sign == '*' ? 0 : 1];
    }
    return result;
}

// The objects of one case: 0 is the one that is set, 1 is a copy of it from before that.
class Objects {
  public:
    // Requires: an init value over at least one name.
    explicit Objects(const Case& given);
    // "" or what is wrong.
    std::string Play(const Step& step);

  private:
    std::string PlayQuestion(const Step& step);
    std::string CompareTable(size_t object) const;
    std::string CompareColumn(size_t object) const;
    std::string CompareVariables(size_t object) const;
    std::string CompareReadBack(size_t object) const;
    void Change(const Step& step);

    std::array<Kq_BoolEquationImp, kNumObjects> m_objects;
    std::array<Expected, kNumObjects> m_expected;
};

bool SetLibrary(const Case& given, Kq_BoolEquationImp& equation)
{
    if (given.isExplicit)
        return equation.SetEquationWithExplicitTerms(support::ToPort(given.names),
                                                     support::ToPort(given.text),
                                                     given.firstIsLowest, given.isReversed);
    equation.Clear();
    for (const std::string& name : given.names)
        equation.DefineVariable(support::ToPort(name), 1);
    return equation.SetEquation(support::ToPort(given.text));
}

bool SetModel(const Case& given, reference::Equation& equation)
{
    if (given.isExplicit)
        return equation.SetEquationWithExplicitTerms(given.names, given.text, given.firstIsLowest,
                                                     given.isReversed);
    equation.Clear();
    for (const std::string& name : given.names)
        equation.DefineVariable(name, 1);
    return equation.SetEquation(given.text);
}

// The names in the order of definition.
Names DefinedNames(const Case& given)
{
    Names names = given.names;
    if (given.isExplicit && given.isReversed)
        std::reverse(names.begin(), names.end());
    return names;
}

bool FirstIsLowest(const Case& given)
{
    return given.isExplicit && given.firstIsLowest;
}

Objects::Objects(const Case& given)
{
    const Case former = {"0x6", {"f", "g"}, true, false, false, {}};
    SetLibrary(former, m_objects[0]);
    m_expected[1].Set(former.text, former.names, false);
    m_objects[1] = m_objects[0];
    SetLibrary(given, m_objects[0]);
    m_expected[0].Set(given.text, DefinedNames(given), FirstIsLowest(given));
    m_objects[2] = m_objects[0];
    m_expected[2] = m_expected[0];
}

std::string Told(bool isRight)
{
    return isRight ? "" : "another answer than the digits give";
}

std::string Objects::Play(const Step& step)
{
    if (step.action < DoSetVariable)
        return PlayQuestion(step);
    Change(step);
    return "";
}

std::string Objects::PlayQuestion(const Step& step)
{
    const Kq_BoolEquationImp& equation = m_objects[step.object];
    const Expected& expected = m_expected[step.object];
    const bool flag = step.value % 2 != 0;
    const bool isHex = expected.isSet && (expected.text[1] == 'x' || expected.text[1] == 'X');
    switch (step.action) {
    case AskEval:
        return Told(equation.Eval() == expected.Eval());
    case AskHex:
        return Told(support::ToStd(equation.GetEquationAsHexInitValue(flag)) ==
                    (expected.isSet ? reference::HexInitValue(expected.Column(), flag) : "0x0"));
    case AskBinary:
        return Told(support::ToStd(equation.GetEquationAsBinaryInitValue()) ==
                    (expected.isSet ? reference::BinaryInitValue(expected.Column()) : "0b"));
    case AskText:
        return Told(support::ToStd(equation.GetEquation(flag)) == expected.text);
    case AskExpression:
        return Told(support::ToStd(equation.GetEquationAsExpression(false)) ==
                    InSyntax(0, expected.Expression()));
    case AskAlternative:
        return Told(support::ToStd(flag ? equation.GetEquationAlt2(false)
                                        : equation.GetEquationAlt3(false)) ==
                    InSyntax(flag ? 1 : 2, expected.Expression()));
    case AskTable:
        return CompareTable(step.object);
    case AskColumn:
        return CompareColumn(step.object);
    case AskKind:
        return Told(!equation != expected.isSet && !equation.IsExpression() &&
                    equation.IsHexInitValue() == isHex &&
                    equation.IsBinaryInitValue() == (expected.isSet && !isHex));
    case AskVariables:
        return CompareVariables(step.object);
    case AskEqual: {
        const Expected& other = m_expected[step.value % kNumObjects];
        return Told((equation == m_objects[step.value % kNumObjects]) ==
                    (expected.text == other.text && expected.Expression() == other.Expression()));
    }
    default:
        return CompareReadBack(step.object);
    }
}

std::string Objects::CompareTable(size_t object) const
{
    const Expected& expected = m_expected[object];
    const Kq_BoolEquationImp::TruthTable table = m_objects[object].GetTruthTable();
    const std::vector<unsigned int> column =
        expected.isSet ? expected.Column() : std::vector<unsigned int>();
    if (table.GetRows().size() != column.size())
        return "truth table has another size";
    for (size_t row = 0; row < column.size(); ++row) {
        const Kq_BoolEquationImp::TruthTable::Row& actual = table.GetRows()[row];
        size_t number = 0;
        for (const unsigned int value : actual.GetVariableValues())
            number = number * 2 + value;
        if (actual.GetResultValue() != column[row] || number != row)
            return "row " + std::to_string(row) + " differs";
    }
    return "";
}

std::string Objects::CompareColumn(size_t object) const
{
    const Expected& expected = m_expected[object];
    std::vector<uint64_t> words(1, 1);
    if (m_objects[object].GetColumn(words) != expected.isSet)
        return "has a column or not";
    const std::vector<unsigned int> column =
        expected.isSet ? expected.Column() : std::vector<unsigned int>();
    if (words.size() != (column.size() + 63) / 64)
        return "column of another size";
    for (size_t row = 0; row < column.size(); ++row) {
        if ((words[row / 64] >> (row % 64) & 1u) != column[row])
            return "row " + std::to_string(row) + " of the column differs";
    }
    return "";
}

std::string Objects::CompareVariables(size_t object) const
{
    const Expected& expected = m_expected[object];
    const auto& variables = m_objects[object].GetVariables();
    if (variables.size() != expected.names.size())
        return "another number of variables";
    for (size_t index = 0; index < variables.size(); ++index) {
        if (support::ToStd(variables[index].first) != expected.names[index] ||
            variables[index].second != expected.values[index])
            return "variable " + std::to_string(index) + " differs";
    }
    return "";
}

// What is rendered reads back as the same function: the binary form over the same names, and the
// expression.
std::string Objects::CompareReadBack(size_t object) const
{
    const Kq_BoolEquationImp& equation = m_objects[object];
    const Expected& expected = m_expected[object];
    if (!expected.isSet)
        return "";
    const std::string binary = reference::BinaryInitValue(expected.Column());
    for (const bool isExpression : {false, true}) {
        Kq_BoolEquationImp again;
        if (!again.SetEquationWithExplicitTerms(support::ToPort(expected.names),
                                                isExpression
                                                    ? equation.GetEquationAsExpression(true)
                                                    : equation.GetEquationAsBinaryInitValue(),
                                                false, false))
            return "the rendering is not read back";
        if (support::ToStd(again.GetEquationAsBinaryInitValue()) != binary)
            return "the rendering is read back as another function";
    }
    return "";
}

void Objects::Change(const Step& step)
{
    Kq_BoolEquationImp& equation = m_objects[step.object];
    Expected& expected = m_expected[step.object];
    const size_t other = step.value % kNumObjects;
    switch (step.action) {
    case DoSetVariable:
        if (!expected.names.empty()) {
            const size_t variable = step.value % expected.names.size();
            const unsigned int value = 1 - expected.values[variable];
            expected.values[variable] = value;
            equation.SetVariable(support::ToPort(expected.names[variable]), value * 7);
        }
        return;
    case DoDefineVariable:
        if (expected.names.size() < kMaxVariables) {
            expected.names.push_back("more" + std::to_string(expected.names.size()));
            expected.values.push_back(1);
            equation.DefineVariable(support::ToPort(expected.names.back()), 1);
        }
        return;
    case DoCopy:
        m_expected[step.object] = Expected(m_expected[other]);
        equation = m_objects[other];
        return;
    default:
        expected = Expected();
        equation.Clear();
    }
}

std::string CompareWithModel(const Case& given)
{
    reference::Equation model;
    Kq_BoolEquationImp library;
    support::Capture capture;
    reference::Log().clear();
    if (SetModel(given, model) != SetLibrary(given, library))
        return "accepted by one side only";
    std::string difference = support::CompareState(model, library);
    if (difference.empty())
        difference = support::CompareResults(model, library);
    return difference.empty() ? support::CompareAndForgetMessages(capture) : difference;
}

} // namespace

std::string Describe(const std::string& input)
{
    const Case given = Read(input);
    std::string text = "\"" + support::Printable(given.text) + "\" over";
    for (const std::string& name : given.names)
        text += " " + name;
    text += given.isExplicit ? ", explicit" : ", defined before";
    text += given.firstIsLowest ? ", termOrderFlag" : "";
    text += given.isReversed ? ", reverseTerms\n" : "\n";
    for (const Step& step : given.steps)
        text += std::string("  ") + kActionNames[step.action] +
                " object=" + std::to_string(step.object) + " value=" + std::to_string(step.value) +
                "\n";
    return text;
}

std::string Check(const std::string& input)
{
    const Case given = Read(input);
    const bool isInitValue =
        !reference::ReadInitValue(given.text, DefinedNames(given), FirstIsLowest(given)).empty();
    // Only the model can judge what is not an init value, or one over no names.
    if (!isInitValue || given.names.size() <= kMaxModelNames) {
        const std::string difference = CompareWithModel(given);
        if (!difference.empty())
            return difference;
    }
    if (!isInitValue || given.names.empty())
        return "";
    Objects objects(given);
    for (size_t position = 0; position < given.steps.size(); ++position) {
        const std::string difference = objects.Play(given.steps[position]);
        if (!difference.empty())
            return "step " + std::to_string(position) + ": " + difference;
    }
    return "";
}

} // namespace fuzz
