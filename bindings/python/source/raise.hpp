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

}  // namespace quarzel::python
