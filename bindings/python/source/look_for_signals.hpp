// SPDX-License-Identifier: MIT
#pragma once

#include <pybind11/pybind11.h>

#include <chrono>

namespace quarzel::python {

/// Whether the user has pressed Ctrl-C; looks every tenth of a second, since that takes the GIL.
class LookForSignals {
  public:
    bool operator()() {
        const auto now = std::chrono::steady_clock::now();
        if (now < itsNext) {
            return false;
        }
        itsNext = now + std::chrono::milliseconds(100);
        const pybind11::gil_scoped_acquire gil;
        return PyErr_CheckSignals() != 0;
    }

  private:
    std::chrono::steady_clock::time_point itsNext =
        std::chrono::steady_clock::now() + std::chrono::milliseconds(100);
};

}  // namespace quarzel::python
