// SPDX-License-Identifier: MIT
#include "raise.hpp"

namespace quarzel::python {

namespace {

PyObject* modelWarning = nullptr;

/// The exception class for a fault. A decoder that was closed raises what a closed file does.
PyObject* exceptionOf(bindings::Fault fault) {
    switch (fault) {
        case bindings::Fault::type:
            return PyExc_TypeError;
        case bindings::Fault::value:
        case bindings::Fault::closed:
            return PyExc_ValueError;
        case bindings::Fault::memory:
            return PyExc_MemoryError;
        default:
            return PyExc_RuntimeError;
    }
}

}  // namespace

void addWarning(pybind11::module_& module) {
    modelWarning = PyErr_NewExceptionWithDoc("quarzel.ModelWarning", "A warning of the model of the core.",
                                             PyExc_UserWarning, nullptr);
    if (modelWarning == nullptr) {
        throw pybind11::error_already_set();
    }
    module.attr("ModelWarning") = pybind11::handle(modelWarning);
}

void raise(const bindings::Outcome& outcome) {
    for (const std::string& warning : outcome.warnings) {
        // The line that is to blame called a method of the package, which called the extension.
        constexpr Py_ssize_t callerOfThePackage = 2;
        if (PyErr_WarnEx(modelWarning, warning.c_str(), callerOfThePackage) != 0) {
            throw pybind11::error_already_set();
        }
    }
    if (outcome.fault == bindings::Fault::interrupted && PyErr_Occurred() != nullptr) {
        throw pybind11::error_already_set();
    }
    if (!outcome.done()) {
        PyErr_SetString(exceptionOf(outcome.fault), outcome.message());
        throw pybind11::error_already_set();
    }
}

}  // namespace quarzel::python
