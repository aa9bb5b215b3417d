// What the lists of questions share: the choice of the object, and answers as text.
#ifndef THREADS_TELLING_H
#define THREADS_TELLING_H

#include "support/library_view.h"
#include "threads/questions.h"

namespace threads {

typedef Kq_BoolEquation Facade;
typedef Kq_BoolEquationImp Engine;
typedef Engine::Node Node;
typedef Port::StringBase<char> String;
typedef const SharedObjects& Objects;

inline const Facade& Of(Objects objects, size_t position, const Facade*)
{
    return objects.equations[position];
}
inline const Engine& Of(Objects objects, size_t position, const Engine*)
{
    return objects.engines[position];
}
inline const Facade::TruthTable& Of(Objects objects, size_t position, const Facade::TruthTable*)
{
    return objects.tables[position];
}
inline const Engine::TruthTable& Of(Objects objects, size_t position, const Engine::TruthTable*)
{
    return objects.engineTables[position];
}
inline const Facade::Handle& Of(Objects objects, size_t position, const Facade::Handle*)
{
    return objects.handles[position];
}

// The object at a position, one that shares its nodes, and one that shares nothing with it.
template <class Object>
const Object& At(Objects objects, size_t position)
{
    return Of(objects, position, static_cast<const Object*>(nullptr));
}
template <class Object>
const Object& Twin(Objects objects, size_t position)
{
    return At<Object>(objects, position ^ 1u);
}
template <class Object>
const Object& Another(Objects objects, size_t position)
{
    return At<Object>(objects, (position + 2) % objects.size());
}

inline std::string Tell(bool answer)
{
    return answer ? "yes" : "no";
}
inline std::string Tell(unsigned int value)
{
    return std::to_string(value);
}
inline std::string Tell(const String& text)
{
    return support::ToStd(text);
}
inline std::string Tell(const std::vector<unsigned int>& values)
{
    std::string text;
    for (const unsigned int value : values)
        text += std::to_string(value) + " ";
    return text;
}
inline std::string Tell(const Facade::Handle& handle)
{
    return Tell(std::vector<unsigned int>(handle.begin(), handle.end()));
}
inline std::string Tell(const std::vector<String>& names)
{
    std::string text;
    for (const String& name : names)
        text += Tell(name) + " ";
    return text;
}
template <class Row>
std::string Tell(const std::vector<Row>& rows)
{
    std::string text;
    for (const Row& row : rows)
        text += Tell(row.GetVariableValues()) + ":" + Tell(row.GetResultValue()) + " ";
    return text;
}
inline std::string Tell(const Node* root)
{
    std::string text;
    for (const reference::FlatNode& node : support::Flatten(root))
        text += std::to_string(node.type) + node.token + std::to_string(node.parent) + "/" +
                std::to_string(node.left) + "/" + std::to_string(node.right) + "/" +
                std::to_string(node.value) + " ";
    return text;
}
inline std::string Tell(bool hasColumn, const std::vector<uint64_t>& words)
{
    std::string text = Tell(hasColumn);
    for (const uint64_t word : words)
        text += " " + std::to_string(word);
    return text;
}

inline String NameOf(const Facade& equation)
{
    return equation.GetNumVariables() == 0 ? "none" : equation.GetVariables().back().first;
}
inline String NameAt(Objects objects, size_t position)
{
    return NameOf(objects.equations[position]);
}

// Questions that objects of several classes answer.

template <class Object>
std::string HasNone(Objects o, size_t at)
{
    return Tell(!At<Object>(o, at));
}
template <class Object>
std::string HasSome(Objects o, size_t at)
{
    return Tell(static_cast<Kq_PtrTester*>(At<Object>(o, at)) != nullptr);
}
template <class Object>
std::string IsEqual(Objects o, size_t at)
{
    return Tell(At<Object>(o, at) == Twin<Object>(o, at)) +
           Tell(At<Object>(o, at) == Another<Object>(o, at));
}
template <class Object>
std::string IsNotEqual(Objects o, size_t at)
{
    return Tell(At<Object>(o, at) != Twin<Object>(o, at)) +
           Tell(At<Object>(o, at) != Another<Object>(o, at));
}
template <class Object>
std::string Dumped(Objects o, size_t at)
{
    At<Object>(o, at).Dbg();
    return "";
}

} // namespace threads

#endif
