#include "support/random_text.h"
#include "threads/telling.h"

namespace threads {

namespace {

void Append(SharedObjects& objects, const std::vector<String>& terms, const std::string& text)
{
    Facade equation;
    Engine engine;
    equation.SetEquationWithExplicitTerms(terms, support::ToPort(text), false, false);
    engine.SetEquationWithExplicitTerms(terms, support::ToPort(text), false, false);
    // The last variable is 1. The tables come from separate objects, so that these are not queried.
    equation.SetVariable(NameOf(equation), 1);
    engine.SetVariable(NameOf(equation), 1);
    Facade other;
    other.SetEquationWithExplicitTerms(terms, support::ToPort(text), false, false);
    for (int twin = 0; twin < 2; ++twin) {
        objects.equations.push_back(equation);
        objects.engines.push_back(engine);
        objects.tables.push_back(other);
        objects.engineTables.push_back(*other.GetImp());
        objects.handles.push_back(other.GetVariableHandle(NameOf(other)));
    }
}

} // namespace

SharedObjects::SharedObjects(unsigned int seed, bool hasLarge)
{
    support::RandomText random(seed);
    const std::vector<std::string> few = {"a", "b", "'c d'"};
    Append(*this, {}, random.WellFormed(1 + random.Below(8), few, true));
    Append(*this, {}, random.WellFormed(20, few, true));
    Append(*this, {"A", "B"}, random.HexInitValue(1));
    Append(*this, {"A", "B", "C"}, random.BinaryInitValue(8));
    if (hasLarge) {
        const std::vector<std::string> many = {"n0", "n1", "n2", "n3", "n4", "n5", "n6"};
        Append(*this, {}, random.WellFormed(40, many, true));
        Append(*this, {}, random.WellFormed(24, many, false));
        Append(*this, {"A", "B", "C", "D", "E", "F", "G"}, random.HexInitValue(32));
    }
    Append(*this, {}, "~1");
    Append(*this, {"A"}, "refused )");
}

} // namespace threads
