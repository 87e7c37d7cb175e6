// SPDX-License-Identifier: MIT
#pragma once

#include <pybind11/pybind11.h>

#include "common/outcome.hpp"

namespace quarzel::python {

/// Make quarzel.ModelWarning and add it to the module.
void addWarning(pybind11::module_& module);

/// Hand the warnings of the model to Python's own and raise what the outcome asks for. The caller holds the
/// GIL.
/// @throws pybind11::error_already_set when the outcome is a fault, or the user has made warnings errors
void raise(const bindings::Outcome& outcome);

/// Run something that throws BindingErrors as Python knows them.
template <class Work>
auto raising(Work work) {
    try {
        return work();
    } catch (const bindings::BindingError& error) {
        raise({error.fault(), error.what(), {}, {}});
        throw;
    }
}

}  // namespace quarzel::python
