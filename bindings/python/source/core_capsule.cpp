// SPDX-License-Identifier: MIT
#include "core_capsule.hpp"

#include <memory>

#include "raise.hpp"

namespace quarzel::python {

using bindings::HostCore;

namespace {
constexpr const char* capsuleName = "quarzel._core";
}  // namespace

pybind11::capsule openCore(int units, int algorithm, int tagWidth, const std::string& implementation) {
    auto core = std::make_unique<HostCore>();
    raise(core->open({units, algorithm, tagWidth}, implementation));
    const pybind11::capsule capsule(core.get(), capsuleName, [](PyObject* object) {
        delete static_cast<HostCore*>(PyCapsule_GetPointer(object, capsuleName));
    });
    core.release();
    return capsule;
}

HostCore& coreOf(const pybind11::capsule& core) {
    void* const pointer = PyCapsule_GetPointer(core.ptr(), capsuleName);
    if (pointer == nullptr) {
        throw pybind11::error_already_set();
    }
    return *static_cast<HostCore*>(pointer);
}

}  // namespace quarzel::python
