// Rendering: from a tree to text in the syntax of its input and in the three fixed ones.
#include <memory>

#include <Kq_BoolEquationImp.h>

#include "support/cases.h"
#include "support/texts.h"

namespace {

typedef std::shared_ptr<Kq_BoolEquation> EquationPointer;
typedef Port::StringBase<char> (Kq_BoolEquation::*Render)(bool spaces) const;

struct Syntax {
    const char* name;
    Render render;
};

const Syntax kSyntaxes[] = {{"as_typed", &Kq_BoolEquation::GetEquation},
                            {"syntax_1", &Kq_BoolEquation::GetEquationAlt1},
                            {"syntax_2", &Kq_BoolEquation::GetEquationAlt2},
                            {"syntax_3", &Kq_BoolEquation::GetEquationAlt3}};

bench::Case MakeRendering(const std::string& text, Render render, bool spaces)
{
    const EquationPointer equation = std::make_shared<Kq_BoolEquation>(text.c_str());
    const double numTokens = double(bench::CountNodes(equation->GetImp()->GetRoot()));
    bench::Case made;
    // Without blanks "~ |" would become "~|", but no text here has a negation before an operator,
    // so what is written reads back the same.
    made.isRight = [=] {
        const Kq_BoolEquation again((*equation.*render)(spaces));
        return bool(again) && again == *equation;
    };
    made.ours = [=](benchmark::State& state) {
        for (auto _ : state)
            benchmark::DoNotOptimize((*equation.*render)(spaces));
        bench::SetItems(state, numTokens, "token");
    };
    return made;
}

} // namespace

void bench::AddCases()
{
    for (const Shape& shape : GetShapes())
        for (size_t numTokens : {20u, 1000u, 100000u})
            for (const Syntax& syntax : kSyntaxes)
                AddSingle(
                    "render/" + shape.name + "/" + syntax.name + "/" + std::to_string(numTokens),
                    [=] { return MakeRendering(shape.make(numTokens, 20), syntax.render, false); });
    for (const Syntax& syntax : kSyntaxes)
        AddSingle(std::string("render_spaced/typical/") + syntax.name + "/1000",
                  [=] { return MakeRendering(MakeTypical(1000, 20, 1), syntax.render, true); });
}
