// Asks the library and the model the same questions and reports the first different answer.
#include "support/text_compare.h"

#include "reference/evaluation.h"
#include "support/equation_compare.h"
#include "support/random_text.h"

namespace support {

namespace {

// Compares node evaluation for tables of arbitrary 32-bit entries, including short tables.
std::string CompareNodeEval(unsigned int seed, const reference::Equation& model,
                            const Kq_BoolEquationImp& library)
{
    RandomText random(seed);
    for (int round = 0; round < 4; ++round) {
        std::vector<unsigned int> values;
        std::vector<std::pair<Port::StringBase<char>, unsigned int>> table;
        const size_t numEntries = model.GetNumVariables() + (round == 3 ? 0 : 1);
        while (values.size() + 1 < numEntries) {
            values.push_back(round == 0 ? static_cast<unsigned int>(random.Below(4))
                                        : random.Any());
            table.push_back({"unused", values.back()});
        }
        const reference::Store& store = model.GetStore();
        if (reference::EvalTree(store.nodes, store.root, values) != library.GetRoot()->Eval(table))
            return "node evaluation differs in round " + std::to_string(round);
    }
    return "";
}

// Compares the trees that both sides read back from their own renderings.
std::string CompareReadBack(const reference::Equation& model, const Kq_BoolEquationImp& library)
{
    reference::Equation modelAgain;
    Kq_BoolEquationImp libraryAgain;
    Capture capture;
    const bool expected = modelAgain.SetEquation(model.GetEquation(true));
    if (expected != libraryAgain.SetEquation(library.GetEquation(true)))
        return "the rendering is read back by one side only";
    if ((modelAgain == model) != (libraryAgain == library) ||
        (modelAgain != model) != (libraryAgain != library))
        return "the rendering is read back as the same tree by one side only";
    return CompareState(modelAgain, libraryAgain);
}

} // namespace

std::string CompareText(unsigned int seed, const std::string& text)
{
    reference::Equation model;
    Kq_BoolEquationImp library;
    Capture capture;
    std::string difference = CompareSet(text, model, library, capture);
    if (!difference.empty() || !model)
        return difference;
    difference = CompareNodeEval(seed, model, library);
    return difference.empty() ? CompareReadBack(model, library) : difference;
}

std::string ShrinkText(unsigned int seed, std::string text)
{
    for (size_t length = text.size() / 2; length > 0; length /= 2) {
        for (size_t position = 0; position + length <= text.size();) {
            std::string shorter = text;
            shorter.erase(position, length);
            if (CompareText(seed, shorter).empty())
                position += length;
            else
                text = shorter;
        }
    }
    return text;
}

} // namespace support
