// The input is a text: it is set, asked everything, and compared with the model. Short texts are
// tried again in debug mode, where traces and dumps have to agree too.
#include "fuzz/target.h"
#include "support/equation_compare.h"
#include "support/text_compare.h"

namespace fuzz {

namespace {

// Traces grow with the square of a text's length.
const size_t kMaxTraced = 40;
const unsigned int kMaxTracedVariables = 4;

std::string CompareTraces(const std::string& text)
{
    reference::Equation model;
    Kq_BoolEquationImp library;
    support::Capture capture;
    support::DebugMode debugMode;
    reference::Log().clear();
    const bool expected = model.SetEquation(text);
    if (expected != library.SetEquation(support::ToPort(text)))
        return "accepted by one side only in debug mode";
    std::string difference = support::CompareAndForgetMessages(capture);
    if (difference.empty() && model.GetNumVariables() <= kMaxTracedVariables) {
        model.Eval();
        library.Eval();
        model.Dbg();
        library.Dbg();
        difference = support::CompareAndForgetMessages(capture);
    }
    return difference.empty() ? "" : "in debug mode, " + difference;
}

} // namespace

std::string Describe(const std::string& input)
{
    return "text \"" + support::Printable(input) + "\"\n";
}

std::string Check(const std::string& input)
{
    const unsigned int seed = static_cast<unsigned int>(input.size());
    const std::string difference = support::CompareText(seed, input);
    if (!difference.empty())
        return difference + "\nreduced: \"" + support::Printable(support::ShrinkText(seed, input)) +
               "\"";
    return input.size() > kMaxTraced ? "" : CompareTraces(input);
}

} // namespace fuzz
