// What the sides are for the player, and the comparison of what they tell.
#include "random/script_run.h"

#include "random/script_player.h"
#include "reference/evaluation.h"
#include "reference/node_dump.h"

namespace script {

namespace {

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
    static bool IsSameTree(const Equation& equation, const Equation& other)
    {
        return !!equation && &equation.GetStore() == &other.GetStore();
    }
    static unsigned int EvalNodes(const Equation& equation, const std::vector<unsigned int>& values)
    {
        const reference::Store& store = equation.GetStore();
        return !equation ? 0 : reference::EvalTree(store.nodes, store.root, values);
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
    static unsigned int Eval(const Kq_BoolEquationImp::Node* root,
                             const std::vector<unsigned int>& values)
    {
        std::vector<std::pair<Text, unsigned int>> table;
        for (const unsigned int value : values)
            table.push_back({"unused", value});
        return root ? root->Eval(table) : 0;
    }
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
    static bool IsSameTree(const Equation& equation, const Equation& other)
    {
        return equation.GetRoot() && equation.GetRoot() == other.GetRoot();
    }
    static unsigned int EvalNodes(const Equation& equation, const std::vector<unsigned int>& values)
    {
        return Eval(equation.GetRoot(), values);
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
    static bool IsSameTree(const Equation& equation, const Equation& other)
    {
        return EngineSide::IsSameTree(*equation.GetImp(), *other.GetImp());
    }
    static unsigned int EvalNodes(const Equation& equation, const std::vector<unsigned int>& values)
    {
        return Eval(equation.GetImp()->GetRoot(), values);
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

template <class Side>
std::string RunOn(const std::vector<Step>& steps, bool looksOften)
{
    support::Capture capture;
    Player<ModelSide> model;
    Player<Side> library;
    const auto compareObject = [&](size_t object) {
        return CompareTold("object " + std::to_string(object), model.Look(object),
                           library.Look(object));
    };
    for (size_t position = 0; position < steps.size(); ++position) {
        const Step& step = steps[position];
        reference::Log().clear();
        capture.messages.clear();
        std::string difference = CompareTold("result", model.Play(step), library.Play(step));
        if (difference.empty())
            difference = support::CompareMessages(reference::Log(), capture.messages);
        // The object that the step worked on and, in turn, all others.
        for (size_t object : {step.object, position % kNumObjects}) {
            if (difference.empty() && looksOften)
                difference = compareObject(object);
        }
        if (!difference.empty())
            return "step " + std::to_string(position) + ": " + difference;
    }
    for (size_t object = 0; object < kNumObjects; ++object) {
        const std::string difference = compareObject(object);
        if (!difference.empty())
            return "at the end, " + difference;
    }
    return "";
}

} // namespace

std::string Run(Side side, const std::vector<Step>& steps, bool looksOften)
{
    return side == Side::Engine ? RunOn<EngineSide>(steps, looksOften)
                                : RunOn<FacadeSide>(steps, looksOften);
}

std::vector<Step> Shrink(Side side, std::vector<Step> steps, bool looksOften)
{
    for (size_t chunk = steps.size() / 2; chunk > 0; chunk = chunk == 1 ? 0 : (chunk + 1) / 2) {
        for (size_t position = 0; position + chunk <= steps.size();) {
            std::vector<Step> shorter(steps.begin(),
                                      steps.begin() + static_cast<std::ptrdiff_t>(position));
            shorter.insert(shorter.end(),
                           steps.begin() + static_cast<std::ptrdiff_t>(position + chunk),
                           steps.end());
            if (Run(side, shorter, looksOften).empty())
                position += chunk;
            else
                steps = shorter;
        }
    }
    return steps;
}

} // namespace script
