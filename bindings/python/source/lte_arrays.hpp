// SPDX-License-Identifier: MIT
#pragma once

#include <pybind11/pybind11.h>

namespace quarzel::python {

/// Add the functions behind quarzel.lte to the module. Arrays have two dimensions, one row for each block,
/// and the streams of blocks three; what users see gives them other shapes. The GIL is released while they
/// work.
void addLte(pybind11::module_& module);

}  // namespace quarzel::python
