// Weights are chosen so that objects hold equations most of the time and often share them.
#include "random/script.h"

#include "support/library_view.h"
#include "support/random_text.h"

namespace script {

namespace {

using support::RandomText;

const char* const kOpNames[] = {"Create",         "CreateFromText", "CreateCopy",
                                "Assign",         "Clear",          "Set",
                                "SetTerms",       "Define",         "SetVar",
                                "GetVar",         "GetHandle",      "UseHandle",
                                "CompareHandles", "DumpHandle",     "CompareObjects",
                                "Eval",           "Render",         "RenderInitValues",
                                "Dump",           "DumpRoot",       "SetDebugMode",
                                "BuildTable",     "CompareTables",  "ReadTable",
                                "Tokenize",       "Build",          "Ask"};

const size_t kWeights[] = {1, 2, 5, 7, 2, 15, 8, 10, 10, 4, 5, 6, 1, 1,
                           4, 6, 4, 4, 2, 2,  1, 4,  2,  2, 2, 0, 20};

std::string Name(RandomText& random)
{
    return random.Chance(75) ? random.OneOf(UsualNames()) : random.OneOf(OddNames());
}

std::string InitValue(RandomText& random, size_t numVariables)
{
    const size_t numRows = size_t(1) << numVariables;
    const size_t kind = random.Below(10);
    if (kind < 4 && numVariables >= 2)
        return random.HexInitValue(numRows / 4);
    if (kind < 8)
        return random.BinaryInitValue(numRows - random.Below(numRows / 2 + 1));
    if (kind < 9)
        return random.Mutated(random.BinaryInitValue(numRows));
    return random.HexInitValue(random.Below(4));
}

std::string EquationText(RandomText& random)
{
    const size_t kind = random.Below(100);
    const size_t numTokens = 1 + random.Below(random.Chance(90) ? 9 : 24);
    if (kind < 55)
        return random.WellFormed(numTokens, UsualNames(), true);
    if (kind < 70)
        return random.Mutated(random.WellFormed(numTokens, UsualNames(), true));
    if (kind < 80)
        return random.TokenSoup(numTokens, UsualNames());
    if (kind < 85)
        return random.Bytes(random.Below(12));
    return InitValue(random, random.Below(4));
}

Op RandomOp(RandomText& random, bool isEngine)
{
    size_t total = 0;
    for (size_t weight : kWeights)
        total += weight;
    for (;;) {
        size_t ticket = random.Below(total);
        size_t op = 0;
        while (ticket >= kWeights[op])
            ticket -= kWeights[op++];
        if (isEngine || static_cast<Op>(op) != Op::Tokenize)
            return static_cast<Op>(op);
    }
}

std::vector<std::string> Terms(RandomText& random, size_t numTerms)
{
    std::vector<std::string> terms;
    while (terms.size() < numTerms)
        terms.push_back(Name(random));
    return terms;
}

Step RandomStep(RandomText& random, bool isEngine)
{
    Step step;
    step.op = RandomOp(random, isEngine);
    step.object = random.Below(kNumObjects);
    step.other = random.Below(kNumObjects);
    step.value = random.Chance(80) ? static_cast<unsigned int>(random.Below(3))
                                   : static_cast<unsigned int>(random.Below(1u << 30) * 4 + 1);
    step.firstFlag = random.Chance(50);
    step.secondFlag = random.Chance(50);
    if (random.Chance(10))
        step.source = random.Chance(60) ? Source::OwnName : Source::OwnRootToken;
    switch (step.op) {
    case Op::Set:
    case Op::CreateFromText:
    case Op::Tokenize:
        step.text = EquationText(random);
        break;
    case Op::SetTerms:
        step.terms = Terms(random, random.Below(random.Chance(95) ? 5 : 36));
        step.text =
            random.Chance(50) ? InitValue(random, step.terms.size() % 5) : EquationText(random);
        break;
    case Op::SetDebugMode:
        step.firstFlag = random.Chance(25);
        break;
    case Op::Ask:
        step.value = static_cast<unsigned int>(random.Below(16));
        break;
    default:
        step.text = Name(random);
    }
    return step;
}

// An init value over existing variables: clear, define, set.
void AppendInitValue(RandomText& random, std::vector<Step>& steps)
{
    Step step;
    step.object = random.Below(kNumObjects);
    step.op = Op::Clear;
    steps.push_back(step);
    const size_t numVariables = random.Below(5);
    for (size_t index = 0; index < numVariables; ++index) {
        step.op = Op::Define;
        step.text = random.Chance(90) ? UsualNames()[index] : Name(random);
        steps.push_back(step);
    }
    step.op = Op::Set;
    step.text = InitValue(random, numVariables);
    steps.push_back(step);
}

// A text tokenized and built by hand, with some of its names defined before and after it.
void AppendBuildByHand(RandomText& random, std::vector<Step>& steps)
{
    Step step;
    step.object = random.Below(kNumObjects);
    step.op = Op::Tokenize;
    step.text = random.WellFormed(1 + random.Below(9), UsualNames(), true);
    steps.push_back(step);
    for (size_t numSteps = random.Below(5); numSteps > 0; --numSteps) {
        step.op = random.Chance(30) ? Op::Build : Op::Define;
        step.text = random.OneOf(UsualNames());
        steps.push_back(step);
    }
    step.op = Op::Build;
    steps.push_back(step);
}

} // namespace

const std::vector<std::string>& UsualNames()
{
    static const std::vector<std::string> names = {"a", "b", "c", "A", "x1", "'q r'"};
    return names;
}

const std::vector<std::string>& OddNames()
{
    static const std::vector<std::string> names = {
        "_",
        "''",
        "'a'+b",
        "'a'xyz",
        "'a')",
        "'a'\n",
        "'",
        "'abc",
        "1x",
        "",
        "a-b",
        "a b",
        "a.",
        "\xc3\xa4",
        std::string("a\0b", 3),
        std::string("a\0", 2),
        std::string("\0a", 2),
        std::string("'\0'", 3),
        "a_name_that_is_much_longer_than_sixteen_characters",
        "a",
        "b"};
    return names;
}

std::vector<Step> RandomScript(unsigned int seed, size_t numSteps, bool isEngine)
{
    RandomText random(seed);
    std::vector<Step> steps;
    while (steps.size() < numSteps) {
        if (random.Chance(3))
            AppendInitValue(random, steps);
        else if (isEngine && random.Chance(3))
            AppendBuildByHand(random, steps);
        else
            steps.push_back(RandomStep(random, isEngine));
    }
    return steps;
}

std::string Describe(const Step& step)
{
    std::string text = kOpNames[static_cast<size_t>(step.op)];
    text += " object=" + std::to_string(step.object) + " other=" + std::to_string(step.other);
    text += " text=\"" + support::Printable(step.text) + "\"";
    if (step.source != Source::Given)
        text += step.source == Source::OwnName ? " (own name)" : " (own root token)";
    if (step.op == Op::SetTerms) {
        text += " terms=";
        for (const std::string& term : step.terms)
            text += "\"" + support::Printable(term) + "\",";
    }
    text += " flags=" + std::to_string(step.firstFlag) + std::to_string(step.secondFlag);
    return text + " value=" + std::to_string(step.value);
}

std::string Describe(const std::vector<Step>& steps)
{
    std::string text;
    for (const Step& step : steps)
        text += "  " + Describe(step) + "\n";
    return text;
}

} // namespace script
