// Random scripts over objects that share nodes, on engine and facade, against the model: every
// result, every message and what can be seen of the objects after each step.
// A failure prints the seed and the script, reduced to the steps that it needs.
#include <gtest/gtest.h>

#include "random/script_player.h"
#include "reference/node_dump.h"

namespace {

using script::Step;

struct ModelSide {
    typedef reference::Equation Equation;
    typedef reference::Handle Handle;
    typedef reference::TruthTable TruthTable;
    typedef std::string Text;

    static std::string ToText(const std::string& text) { return text; }
    static std::vector<std::string> ToTexts(const std::vector<std::string>& texts) { return texts; }
    static std::string ToStd(const std::string& text) { return text; }
    static void SetDebugMode(bool on) { reference::SetDebugMode(on); }
    static Equation* Construct(const std::string& givenText)
    {
        const std::string text = givenText;
        Equation* equation = new Equation;
        equation->SetEquation(text);
        return equation;
    }
    static void Assign(Equation& to, const Equation& from, unsigned int) { to = from; }
    static std::vector<reference::FlatNode> Tree(const Equation& equation)
    {
        return reference::Flatten(equation.GetStore());
    }
    static const std::string* RootToken(const Equation& equation)
    {
        const reference::Store& store = equation.GetStore();
        return !equation ? nullptr : &store.nodes[static_cast<size_t>(store.root)].token;
    }
    static void DumpRoot(const Equation& equation)
    {
        if (!!equation)
            reference::DumpNode(equation.GetStore().nodes, equation.GetStore().root);
    }
    static void Tokenize(Equation& equation, const std::string& text)
    {
        equation.TokenizeNodes(text);
    }
    static void Build(Equation& equation) { equation.BuildTree(); }
};

struct LibraryTexts {
    typedef Kq_BoolEquation::Handle Handle;
    typedef Port::StringBase<char> Text;

    static Text ToText(const std::string& text) { return support::ToPort(text); }
    static std::vector<Text> ToTexts(const std::vector<std::string>& texts)
    {
        return support::ToPort(texts);
    }
    static std::string ToStd(const Text& text) { return support::ToStd(text); }
    static void SetDebugMode(bool on) { Kq_BoolEquationImp::SetInternalDebugMode(on); }
    static const Text* TokenOf(const Kq_BoolEquationImp::Node* root)
    {
        return root ? &root->GetToken() : nullptr;
    }
    static void Dump(const Kq_BoolEquationImp::Node* root)
    {
        if (root)
            root->Dbg();
    }
};

struct EngineSide : LibraryTexts {
    typedef Kq_BoolEquationImp Equation;
    typedef Kq_BoolEquationImp::TruthTable TruthTable;

    static Equation* Construct(const Text& text)
    {
        Equation* equation = new Equation;
        equation->SetEquation(text);
        return equation;
    }
    static void Assign(Equation& to, const Equation& from, unsigned int way)
    {
        if (way % 2 == 0)
            to = from;
        else
            to.Copy(from);
    }
    static std::vector<reference::FlatNode> Tree(const Equation& equation)
    {
        return support::Flatten(equation.GetRoot());
    }
    static const Text* RootToken(const Equation& equation) { return TokenOf(equation.GetRoot()); }
    static void DumpRoot(const Equation& equation) { Dump(equation.GetRoot()); }
    static void Tokenize(Equation& equation, const std::string& text)
    {
        equation.TokenizeNodes(text.c_str());
    }
    static void Build(Equation& equation) { equation.BuildTree(); }
};

struct FacadeSide : LibraryTexts {
    typedef Kq_BoolEquation Equation;
    typedef Kq_BoolEquation::TruthTable TruthTable;

    static Equation* Construct(const Text& text) { return new Equation(text); }
    static void Assign(Equation& to, const Equation& from, unsigned int way)
    {
        if (way % 3 == 0)
            to = from;
        else if (way % 3 == 1)
            to.Copy(from);
        else
            to.SetEquationFromEquation(from);
    }
    static std::vector<reference::FlatNode> Tree(const Equation& equation)
    {
        return support::Flatten(equation.GetImp()->GetRoot());
    }
    static const Text* RootToken(const Equation& equation)
    {
        return TokenOf(equation.GetImp()->GetRoot());
    }
    static void DumpRoot(const Equation& equation) { Dump(equation.GetImp()->GetRoot()); }
    static void Tokenize(Equation&, const std::string&) {}
    static void Build(Equation&) {}
};

std::string CompareTold(const std::string& what, const std::string& expected,
                        const std::string& actual)
{
    if (expected == actual)
        return "";
    return what + " should be \"" + support::Printable(expected) + "\" but is \"" +
           support::Printable(actual) + "\"";
}

// The first difference between the two sides, or "".
template <class Side>
std::string Run(const std::vector<Step>& steps)
{
    support::Capture capture;
    script::Player<ModelSide> model;
    script::Player<Side> library;
    for (size_t position = 0; position < steps.size(); ++position) {
        const Step& step = steps[position];
        const std::string where = "step " + std::to_string(position) + ": ";
        reference::Log().clear();
        capture.messages.clear();
        std::string difference = CompareTold("result", model.Play(step), library.Play(step));
        if (difference.empty())
            difference = support::CompareMessages(reference::Log(), capture.messages);
        // The object that the step worked on and, in turn, all others.
        for (size_t object : {step.object, position % script::kNumObjects}) {
            if (difference.empty())
                difference = CompareTold("object " + std::to_string(object), model.Look(object),
                                         library.Look(object));
        }
        if (!difference.empty())
            return where + difference;
    }
    for (size_t object = 0; object < script::kNumObjects; ++object) {
        const std::string difference = CompareTold("at the end, object " + std::to_string(object),
                                                   model.Look(object), library.Look(object));
        if (!difference.empty())
            return difference;
    }
    return "";
}

// Leaves out steps, many at once first, while the script still fails.
template <class Side>
std::vector<Step> Shrink(std::vector<Step> steps)
{
    for (size_t chunk = steps.size() / 2; chunk > 0; chunk = chunk == 1 ? 0 : (chunk + 1) / 2) {
        for (size_t position = 0; position + chunk <= steps.size();) {
            std::vector<Step> shorter(steps.begin(),
                                      steps.begin() + static_cast<std::ptrdiff_t>(position));
            shorter.insert(shorter.end(),
                           steps.begin() + static_cast<std::ptrdiff_t>(position + chunk),
                           steps.end());
            if (Run<Side>(shorter).empty())
                position += chunk;
            else
                steps = shorter;
        }
    }
    return steps;
}

template <class Side>
void ExpectScriptsAgree(unsigned int firstSeed, unsigned int numScripts, size_t numSteps,
                        bool isEngine)
{
    for (unsigned int seed = firstSeed; seed < firstSeed + numScripts; ++seed) {
        const std::vector<Step> steps = script::RandomScript(seed, numSteps, isEngine);
        if (Run<Side>(steps).empty())
            continue;
        const std::vector<Step> shrunk = Shrink<Side>(steps);
        std::string report = "seed " + std::to_string(seed) + "\n";
        for (const Step& step : shrunk)
            report += "  " + script::Describe(step) + "\n";
        FAIL() << report << Run<Side>(shrunk);
    }
}

TEST(Scripts, ShortEngineScriptsAgreeWithTheModel)
{
    ExpectScriptsAgree<EngineSide>(1, 6000, 15, true);
}

TEST(Scripts, LongEngineScriptsAgreeWithTheModel)
{
    ExpectScriptsAgree<EngineSide>(100001, 1000, 120, true);
}

TEST(Scripts, ShortFacadeScriptsAgreeWithTheModel)
{
    ExpectScriptsAgree<FacadeSide>(200001, 6000, 15, false);
}

TEST(Scripts, LongFacadeScriptsAgreeWithTheModel)
{
    ExpectScriptsAgree<FacadeSide>(300001, 1000, 120, false);
}

} // namespace
