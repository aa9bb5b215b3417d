// The type from which booleq.Equation is derived: construction, values, comparison, and the given
// arguments. Everything else is a function of the module that the Python half calls.
#include <cstddef>
#include <cstring>
#include <new>
#include <utility>
#include <vector>

#include "equation.h"

#include <structmember.h>

#include "errors.h"
#include "text.h"
#include "unicode.h"

namespace booleq_python {

namespace {

struct CoreHead {
    PyObject_HEAD PyObject* weakReferences;
};

struct CoreObject : CoreHead {
    Equation value;
};

PyTypeObject* coreType = nullptr;      // owned, never released
PyTypeObject* equationClass = nullptr; // owned, never released; the class of new objects

// Calls 'work' for a C function: a C++ exception becomes a Python exception, and 'failure' is
// returned.
template <class Result, class Work>
Result Guarded(Result failure, const Work& work)
{
    try {
        return work();
    } catch (py::error_already_set& error) {
        error.restore();
    } catch (const py::builtin_exception& error) {
        error.set_error();
    } catch (const std::bad_alloc&) {
        PyErr_NoMemory();
    } catch (const std::exception& error) {
        PyErr_SetString(PyExc_RuntimeError, error.what());
    }
    return failure;
}

const Equation& ValueOf(PyObject* self)
{
    return reinterpret_cast<CoreObject*>(self)->value;
}

PyObject* New(PyTypeObject* type, PyObject* arguments, PyObject* named)
{
    static const char* kNames[] = {"text", "inputs", "lsb_first", nullptr};
    PyObject* text = nullptr;
    PyObject* inputs = Py_None;
    PyObject* lsbFirst = Py_False;
    if (!PyArg_ParseTupleAndKeywords(arguments, named, "O|OO:Equation", const_cast<char**>(kNames),
                                     &text, &inputs, &lsbFirst))
        return nullptr;
    if (type != equationClass) {
        PyErr_SetString(PyExc_TypeError, "Equation cannot have derived classes");
        return nullptr;
    }
    return Guarded<PyObject*>(nullptr, [&] {
        return MakeEquation(py::reinterpret_borrow<py::object>(text),
                            py::reinterpret_borrow<py::object>(inputs),
                            py::reinterpret_borrow<py::object>(lsbFirst))
            .release()
            .ptr();
    });
}

void Destroy(PyObject* self)
{
    PyTypeObject* const type = Py_TYPE(self);
    if (reinterpret_cast<CoreObject*>(self)->weakReferences)
        PyObject_ClearWeakRefs(self);
    reinterpret_cast<CoreObject*>(self)->value.~Equation();
    type->tp_free(self);
    Py_DECREF(type);
}

std::string Listed(const std::vector<std::string>& names)
{
    constexpr size_t kMaxListed = 20;
    std::string text;
    for (size_t place = 0; place < names.size() && place < kMaxListed; ++place)
        text += (place == 0 ? "" : ", ") + booleq::Excerpt(names[place]);
    if (names.size() > kMaxListed)
        text += " and " + std::to_string(names.size() - kMaxListed) + " more";
    return text;
}

[[noreturn]] void RaiseUnknown(const Equation& equation, const py::handle& name)
{
    const std::vector<std::string> inputs = equation.InputBytes();
    throw py::type_error(
        "there is no input " + Shown(name) +
        (inputs.empty() ? "; there are none" : "; the inputs are " + Listed(inputs)));
}

// Collects the values of inputs by name.
class Values {
  public:
    explicit Values(const Equation& equation)
        : m_equation(equation), m_values(equation.NumInputs(), kNone)
    {
    }

    // Takes the items of a dict.
    void Take(PyObject* values)
    {
        PyObject* const inputs = m_equation.Inputs().ptr();
        const auto size = static_cast<size_t>(PyDict_GET_SIZE(values));
        size_t numFound = 0;
        for (size_t input = 0; input < m_values.size() && numFound < size; ++input) {
            PyObject* const name = PyTuple_GET_ITEM(inputs, static_cast<Py_ssize_t>(input));
            PyObject* const value = PyDict_GetItemWithError(values, name);
            if (!value && PyErr_Occurred())
                throw py::error_already_set();
            if (!value)
                continue;
            ++numFound;
            Set(input, name, value);
        }
        if (numFound < size)
            TakeOthers(values);
    }

    const std::vector<unsigned int>& All() const
    {
        std::vector<std::string> missing;
        for (size_t input = 0; input < m_values.size(); ++input)
            if (m_values[input] == kNone)
                missing.push_back(m_equation.InputBytes()[input]);
        if (!missing.empty())
            throw py::type_error("missing " + booleq::Count(missing.size(), "value") + ": " +
                                 Listed(missing) +
                                 "; every input has one, and cofactor() fixes some of them");
        return m_values;
    }

  private:
    static constexpr unsigned int kNone = 2;

    void Set(size_t input, PyObject* name, PyObject* value)
    {
        if (m_values[input] != kNone)
            throw py::type_error("the value of " + Shown(name) + " is given twice");
        m_values[input] = RequireBit(value, name);
    }

    // Takes names that are not equal to an input as str: other strs of the same bytes (escaped
    // bytes that together are UTF-8 are listed as the character), and names that are not inputs.
    void TakeOthers(PyObject* values)
    {
        PyObject* name = nullptr;
        PyObject* value = nullptr;
        Py_ssize_t position = 0;
        while (PyDict_Next(values, &position, &name, &value)) {
            const int isInput = PySequence_Contains(m_equation.Inputs().ptr(), name);
            if (isInput < 0)
                throw py::error_already_set();
            if (isInput == 1)
                continue;
            const py::object same = PyUnicode_Check(name) && !PyUnicode_IS_ASCII(name)
                                        ? SameInBytes(py::reinterpret_borrow<py::str>(name))
                                        : py::object();
            const Py_ssize_t input =
                same ? PySequence_Index(m_equation.Inputs().ptr(), same.ptr()) : -1;
            PyErr_Clear();
            if (input < 0)
                RaiseUnknown(m_equation, name);
            Set(static_cast<size_t>(input), name, value);
        }
    }

    const Equation& m_equation;
    std::vector<unsigned int> m_values;
};

// The one positional argument is taken by hand, so that an input may have any name.
PyObject* Call(PyObject* self, PyObject* arguments, PyObject* named)
{
    return Guarded<PyObject*>(nullptr, [&] {
        const Equation& equation = ValueOf(self);
        const Py_ssize_t numArguments = PyTuple_GET_SIZE(arguments);
        if (numArguments > 1)
            throw py::type_error("values are one mapping, or named: " +
                                 booleq::Count(static_cast<uint64_t>(numArguments), "argument") +
                                 " given");
        Values values(equation);
        if (numArguments == 1) {
            const py::handle mapping = PyTuple_GET_ITEM(arguments, 0);
            if (PyDict_Check(mapping.ptr())) {
                values.Take(mapping.ptr());
            } else {
                if (PyUnicode_Check(mapping.ptr()) || !PyMapping_Check(mapping.ptr()) ||
                    !py::hasattr(mapping, "keys"))
                    throw py::type_error("values must be a mapping of names to 0 and 1, not " +
                                         TypeName(mapping));
                const py::dict copy = py::reinterpret_steal<py::dict>(PyDict_New());
                if (PyDict_Update(copy.ptr(), mapping.ptr()) != 0)
                    throw py::error_already_set();
                values.Take(copy.ptr());
            }
        }
        if (named)
            values.Take(named);
        return PyLong_FromLong(static_cast<long>(equation.Evaluate(values.All())));
    });
}

PyObject* Compare(PyObject* self, PyObject* other, int question)
{
    if (!IsEquation(self) || !IsEquation(other))
        Py_RETURN_NOTIMPLEMENTED;
    return Guarded<PyObject*>(nullptr, [&] {
        const Equation& left = ValueOf(self);
        const Equation& right = ValueOf(other);
        if (question == Py_EQ || question == Py_NE)
            return PyBool_FromLong(left.IsSame(right) == (question == Py_EQ));
        const int order = left.Compare(right);
        Py_RETURN_RICHCOMPARE(order, 0, question);
    });
}

Py_hash_t Hash(PyObject* self)
{
    return Guarded<Py_hash_t>(-1, [&] {
        const auto hash = static_cast<Py_hash_t>(ValueOf(self).Hash());
        return hash == -1 ? -2 : hash;
    });
}

int IsTrue(PyObject* /*self*/)
{
    PyErr_SetString(PyExc_TypeError,
                    "an Equation is neither true nor false: call it with values, or ask "
                    "satisfiable(), is_tautology() or equivalent(); & | ^ ~ join equations");
    return -1;
}

template <const py::object& (Equation::*get)() const>
PyObject* Get(PyObject* self, void* /*closure*/)
{
    return Guarded<PyObject*>(nullptr, [&] { return (ValueOf(self).*get)().inc_ref().ptr(); });
}

PyObject* IsLsbFirst(PyObject* self, void* /*closure*/)
{
    return PyBool_FromLong(ValueOf(self).IsLsbFirst());
}

PyGetSetDef properties[] = {
    {"text", Get<&Equation::Text>, nullptr, "The text as it was given.", nullptr},
    {"inputs", Get<&Equation::Inputs>, nullptr,
     "All inputs in their order, the most significant first.", nullptr},
    {"given_inputs", Get<&Equation::GivenInputs>, nullptr,
     "The inputs as they were listed, None without a list.", nullptr},
    {"lsb_first", IsLsbFirst, nullptr, "The flag as it was given.", nullptr},
    {nullptr, nullptr, nullptr, nullptr, nullptr}};

PyMemberDef members[] = {
    {"__weaklistoffset__", T_PYSSIZET, offsetof(CoreHead, weakReferences), READONLY, nullptr},
    {nullptr, 0, 0, 0, nullptr}};

PyType_Slot slots[] = {
    {Py_tp_new, reinterpret_cast<void*>(New)},
    {Py_tp_dealloc, reinterpret_cast<void*>(Destroy)},
    {Py_tp_call, reinterpret_cast<void*>(Call)},
    {Py_tp_richcompare, reinterpret_cast<void*>(Compare)},
    {Py_tp_hash, reinterpret_cast<void*>(Hash)},
    {Py_nb_bool, reinterpret_cast<void*>(IsTrue)},
    {Py_tp_getset, properties},
    {Py_tp_members, members},
    {Py_tp_doc, const_cast<char*>("Core(text, inputs=None, lsb_first=False)\n--\n\n"
                                  "What booleq.Equation is made of.")},
    {0, nullptr}};

PyType_Spec spec = {"booleq._booleq.Core", sizeof(CoreObject), 0,
                    Py_TPFLAGS_DEFAULT | Py_TPFLAGS_BASETYPE, slots};

} // namespace

py::object Wrap(Equation equation)
{
    PyObject* const self = equationClass->tp_alloc(equationClass, 0);
    if (!self)
        throw py::error_already_set();
    new (&reinterpret_cast<CoreObject*>(self)->value) Equation(std::move(equation));
    return py::reinterpret_steal<py::object>(self);
}

bool IsEquation(const py::handle& value)
{
    return Py_TYPE(value.ptr()) == equationClass;
}

const Equation& Own(const py::handle& value)
{
    return RequireEquation(value, "the equation");
}

const Equation& RequireEquation(const py::handle& value, const char* what)
{
    if (!IsEquation(value))
        throw py::type_error(std::string(what) + " must be an Equation, not " + TypeName(value));
    return ValueOf(value.ptr());
}

py::object ToEquation(const py::handle& value)
{
    if (IsEquation(value))
        return py::reinterpret_borrow<py::object>(value);
    if (PyUnicode_Check(value.ptr()))
        return ReadEquation(RequireStr(value, "text"), py::none(), false);
    unsigned int bit = 0;
    if (!IsBit(value, bit))
        return {};
    return ReadEquation(py::str(bit == 1 ? "1" : "0"), py::none(), false);
}

void BindCore(py::module_& module)
{
    PyObject* const type = PyType_FromSpec(&spec);
    if (!type)
        throw py::error_already_set();
    coreType = reinterpret_cast<PyTypeObject*>(type);
    module.attr("Core") = py::reinterpret_borrow<py::object>(type);
}

void SetEquationClass(const py::object& type)
{
    if (!PyType_Check(type.ptr()) ||
        PyType_IsSubtype(reinterpret_cast<PyTypeObject*>(type.ptr()), coreType) == 0)
        throw py::type_error("a class that is derived from Core");
    equationClass = reinterpret_cast<PyTypeObject*>(type.inc_ref().ptr());
    // The garbage collector tracks objects of classes written in Python. Equations hold texts and
    // names and never each other, and a million of them would make it scan all memory again and
    // again.
    // Requires: no objects exist yet.
    equationClass->tp_flags &= ~Py_TPFLAGS_HAVE_GC;
    equationClass->tp_traverse = nullptr;
    equationClass->tp_clear = nullptr;
    equationClass->tp_alloc = PyType_GenericAlloc;
    equationClass->tp_free = PyObject_Free;
    equationClass->tp_dealloc = Destroy;
}

} // namespace booleq_python
