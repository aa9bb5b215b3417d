// The compiled half of the package booleq, which booleq/*.py calls. Long work releases the
// interpreter's lock (lock.h); any number of threads may use the library underneath.
#include <pybind11/pybind11.h>

#include "bind.h"
#include "lock.h"
#include "text.h"

namespace {

namespace py = pybind11;

bool IsPrintable(uint32_t character)
{
    return _PyUnicode_IsPrintable(character) != 0;
}

void Fill(py::module_ module)
{
    using namespace booleq_python;
    module.attr("__version__") = BOOLEQ_VERSION;
    booleq::ShowUtf8(IsPrintable);
    PrepareInterrupts();
    BindCore(module);
    BindTexts(module);
    BindBatch(module);
    BindMany(module);
    BindAlgebra(module);
    BindQuestions(module);
    BindArrays(module);
    BindLuts(module);
    BindNetlists(module);
    BindMinimize(module);
    BindReports(module);
}

// Runs when an interpreter imports the module. pybind11 keeps its data about types once for the
// process, so any other interpreter would use objects that belong to the main one.
int Import(PyObject* self)
{
    if (PyInterpreterState_Get() != PyInterpreterState_Main()) {
        PyErr_SetString(PyExc_ImportError, "booleq works in the main interpreter only, not in a "
                                           "subinterpreter; use threads or processes");
        return -1;
    }
    try {
        py::detail::get_internals();
        Fill(py::reinterpret_borrow<py::module_>(self));
        return 0;
    } catch (py::error_already_set& error) {
        error.restore();
    } catch (const std::exception& error) {
        PyErr_SetString(PyExc_ImportError, error.what());
    }
    return -1;
}

PyModuleDef_Slot slots[] = {{Py_mod_exec, reinterpret_cast<void*>(Import)}, {0, nullptr}};

PyModuleDef definition = {PyModuleDef_HEAD_INIT,
                          "_booleq",
                          "The compiled half of booleq.",
                          0,
                          nullptr,
                          slots,
                          nullptr,
                          nullptr,
                          nullptr};

} // namespace

extern "C" PYBIND11_EXPORT PyObject* PyInit__booleq();

// Multi-phase initialisation, so that each interpreter that imports the module runs Import.
PyObject* PyInit__booleq()
{
    return PyModuleDef_Init(&definition);
}
