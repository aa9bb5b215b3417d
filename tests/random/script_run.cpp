// The model as a side of the player, and the comparison of the sides' results.
#include "random/script_run.h"

#include "random/library_sides.h"
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
        // Looks at the object of the step and at one of the others in turn.
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
