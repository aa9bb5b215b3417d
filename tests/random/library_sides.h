// Engine and facade as sides of the player: their type names and conversions of texts.
#ifndef RANDOM_LIBRARY_SIDES_H
#define RANDOM_LIBRARY_SIDES_H

#include "support/library_view.h"

namespace script {

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

} // namespace script

#endif
