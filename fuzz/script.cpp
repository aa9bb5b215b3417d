// The input is a script: steps over a few objects that share nodes, on the engine or the facade,
// compared with the model. The first byte says on which, and whether the objects are inspected
// after each step.
#include <algorithm>

#include "fuzz/bytes.h"
#include "fuzz/target.h"
#include "random/script_run.h"
#include "support/library_view.h"

namespace fuzz {

namespace {

using script::Op;
using script::Side;
using script::Step;

const size_t kMaxSteps = 60;
// In debug mode the builder dumps the tree after each token, so init values stay small.
const size_t kMaxInitVariables = 4;

struct Script {
    Side side;
    bool looksOften;
    std::vector<Step> steps;
};

std::string Name(Bytes& bytes)
{
    const size_t choice = bytes.Next();
    const std::vector<std::string>& usual = script::UsualNames();
    const std::vector<std::string>& odd = script::OddNames();
    if (choice < usual.size())
        return usual[choice];
    if (choice < usual.size() + odd.size())
        return odd[choice - usual.size()];
    return choice >= 0xf0 ? bytes.Raw(choice - 0xf0) : usual[choice % usual.size()];
}

// As many digits as the variables need or, rarely, any number.
std::string InitValue(Bytes& bytes, size_t numVariables)
{
    const size_t form = bytes.Next();
    const bool isHex = form % 2 != 0;
    const size_t numRows = size_t(1) << std::min(numVariables, kMaxInitVariables);
    size_t numDigits = isHex ? (numRows + 3) / 4 : numRows;
    if (form / 4 % 8 == 7)
        numDigits = bytes.Below(2 * numRows);
    std::string text = isHex ? "0x" : "0b";
    if (form / 2 % 2 != 0)
        text[1] = isHex ? 'X' : 'B';
    const std::string digits = isHex ? "0123456789abcdefABCDEF" : "01";
    while (text.size() < numDigits + 2)
        text += digits[bytes.Below(digits.size())];
    return text;
}

std::string Tokens(Bytes& bytes, size_t numTokens)
{
    static const std::vector<std::string> kTokens = {
        "a",     "b",     "c",     "A",  "x1",     "'q r'", "0",   "1",    "~",  "!",
        ".NOT.", "(",     ")",     "()", "& ",     "| ",    "^ ",  "~&",   "~|", "^",
        "~ & ",  "~ | ",  "~^",    "!|", ".NAND.", "*",     "+",   "@",    "~@", "!+",
        " ",     ".XOR.", "(a|b)", "\t", "\n",     "?",     ".X.", "''''", "'"};
    std::string text;
    for (size_t token = 0; token < numTokens && !bytes.IsAtEnd(); ++token)
        text += bytes.OneOf(kTokens);
    return text;
}

std::string EquationText(Bytes& bytes, size_t numVariables)
{
    const size_t kind = bytes.Next();
    if (kind < 0x80)
        return Tokens(bytes, kind % 32);
    if (kind < 0xa0)
        return bytes.Raw(kind - 0x80);
    return InitValue(bytes, numVariables);
}

// An init value over variables that exist: clear, define, set.
void AppendInitValue(Bytes& bytes, Step step, std::vector<Step>& steps)
{
    const size_t numVariables = bytes.Below(kMaxInitVariables + 1);
    step.source = script::Source::Given;
    step.op = Op::Clear;
    steps.push_back(step);
    for (size_t index = 0; index < numVariables; ++index) {
        step.op = Op::Define;
        step.text = script::UsualNames()[index];
        steps.push_back(step);
    }
    step.op = Op::Set;
    step.text = InitValue(bytes, numVariables);
    steps.push_back(step);
}

void AppendStep(Bytes& bytes, Side side, std::vector<Step>& steps)
{
    const size_t numOps = static_cast<size_t>(Op::kCount);
    const size_t op = bytes.Below(numOps + 2);
    const size_t places = bytes.Next();
    const size_t value = bytes.Next();
    Step step;
    step.object = places % script::kNumObjects;
    step.other = places / 4 % script::kNumObjects;
    step.firstFlag = places / 16 % 2 != 0;
    step.secondFlag = places / 32 % 2 != 0;
    if (places / 64 != 0)
        step.source = static_cast<script::Source>(places / 64 % 3);
    step.value = static_cast<unsigned int>(value == 0xff ? 0x80000001u : value);
    if (op >= numOps)
        return AppendInitValue(bytes, step, steps);

    step.op = static_cast<Op>(op);
    if (side == Side::Facade && (step.op == Op::Tokenize || step.op == Op::Build))
        step.op = Op::Ask;
    if (step.op == Op::Set || step.op == Op::CreateFromText || step.op == Op::Tokenize) {
        step.text = EquationText(bytes, value % 5);
    } else if (step.op == Op::SetTerms) {
        const size_t numTerms = value < 0xf0 ? value % 5 : 31 + value % 4;
        while (step.terms.size() < numTerms)
            step.terms.push_back(Name(bytes));
        step.text = EquationText(bytes, numTerms);
    } else if (step.op == Op::Define || step.op == Op::SetVariable || step.op == Op::GetVariable ||
               step.op == Op::GetHandle) {
        step.text = Name(bytes);
    }
    steps.push_back(step);
}

Script Read(const std::string& input)
{
    Bytes bytes(input);
    const size_t kind = bytes.Next();
    Script script = {kind % 2 != 0 ? Side::Facade : Side::Engine, kind / 2 % 2 != 0, {}};
    while (!bytes.IsAtEnd() && script.steps.size() < kMaxSteps)
        AppendStep(bytes, script.side, script.steps);
    return script;
}

} // namespace

std::string Describe(const std::string& input)
{
    const Script script = Read(input);
    return std::string(script.side == Side::Engine ? "engine" : "facade") +
           (script.looksOften ? ", looked at after each step:\n" : ":\n") +
           script::Describe(script.steps);
}

std::string Check(const std::string& input)
{
    const Script script = Read(input);
    const std::string difference = script::Run(script.side, script.steps, script.looksOften);
    if (difference.empty())
        return "";
    const std::vector<Step> shrunk = script::Shrink(script.side, script.steps, script.looksOften);
    return difference + "\nreduced:\n" + script::Describe(shrunk) +
           script::Run(script.side, shrunk, script.looksOften);
}

} // namespace fuzz
