// SPDX-License-Identifier: MIT
#pragma once

#include <pybind11/pybind11.h>

#include <string>
#include <utility>

#include "common/host_core.hpp"

/// A core in the hands of Python is a capsule. Of an object of a class pybind11 takes a note, and where it
/// lacks the memory for that, it frees the object twice or ends the program.
namespace quarzel::python {

/// A new core.
/// @throws pybind11::error_already_set, std::bad_alloc
pybind11::capsule openCore(int units, int algorithm, int tagWidth, const std::string& implementation);

bindings::HostCore& coreOf(const pybind11::capsule& core);

/// A function of a core as one of its capsule.
template <class Result, class... Arguments>
auto onCore(Result (*work)(bindings::HostCore&, Arguments...)) {
    return [work](const pybind11::capsule& core, Arguments... arguments) {
        return work(coreOf(core), std::forward<Arguments>(arguments)...);
    };
}

}  // namespace quarzel::python
