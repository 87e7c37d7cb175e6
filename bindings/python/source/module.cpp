// SPDX-License-Identifier: MIT
// The extension behind the package: arrays in, arrays out. What users see is written in Python around it.
#include <pybind11/stl.h>

#include <algorithm>
#include <string>
#include <tuple>
#include <vector>

#include "common/encoding.hpp"
#include "common/quantising.hpp"
#include "core_capsule.hpp"
#include "decode_arrays.hpp"
#include "lte_arrays.hpp"
#include "plain_decode.hpp"
#include "raise.hpp"
#include "trace_arrays.hpp"

namespace py = pybind11;

namespace {

using namespace quarzel::python;
using quarzel::bindings::HostCore;

std::string implementationOf(HostCore& core) {
    return core.implementation();
}

void closeCore(HostCore& core) {
    raise(core.close());
}

Bytes encode(const Bytes& bits) {
    const auto blocks = bits.shape(0);
    const auto K = bits.shape(1);
    Bytes code({blocks, py::ssize_t{3}, K + py::ssize_t{quarzel::tailPositions}});
    quarzel::bindings::Outcome outcome;
    {
        const auto* const from = bits.data();
        auto* const to = code.mutable_data();
        const py::gil_scoped_release release;
        outcome = quarzel::bindings::encode(from, static_cast<std::size_t>(K),
                                            static_cast<std::size_t>(blocks), to);
    }
    raise(outcome);
    return code;
}

/// @param values  an array of any shape, in C order
template <class Real>
py::array_t<std::int8_t> quantise(const py::array_t<Real, py::array::c_style>& values, double scale) {
    py::array_t<std::int8_t> soft(std::vector<py::ssize_t>(values.shape(), values.shape() + values.ndim()));
    const auto size = static_cast<std::size_t>(values.size());
    const std::span<const Real> from(values.data(), size);
    const std::span<std::int8_t> to(soft.mutable_data(), size);
    quarzel::bindings::Outcome outcome;
    {
        const py::gil_scoped_release release;
        outcome = quarzel::bindings::quantise(from, scale, to);
    }
    raise(outcome);
    return soft;
}

std::vector<std::uint32_t> blockSizes() {
    std::vector<std::uint32_t> sizes;
    for (const quarzel::BlockSize& size : quarzel::blockSizes()) {
        sizes.push_back(size.K);
    }
    return sizes;
}

/// @param K  a block size
py::array_t<std::int32_t> qpp(std::uint32_t K) {
    const std::vector<unsigned> indices = quarzel::permutation(K);
    py::array_t<std::int32_t> permutation(static_cast<py::ssize_t>(indices.size()));
    std::copy(indices.begin(), indices.end(), permutation.mutable_data());
    return permutation;
}

/// The number of segments, and the lengths of the windows of one of them, from the lowest up.
std::tuple<unsigned, std::vector<unsigned>> layout(std::uint32_t K, std::uint32_t units) {
    const quarzel::Layout layout = quarzel::layout(K, units);
    return {layout.segments, {layout.window_steps, layout.window_steps + layout.windows}};
}

/// The signals of a pass, each with the number of its first column and its columns.
std::vector<std::tuple<std::string, unsigned, unsigned>> signals() {
    std::vector<std::tuple<std::string, unsigned, unsigned>> list;
    for (const quarzel::Signal& signal : quarzel::signals()) {
        list.emplace_back(signal.name, signal.first, signal.width);
    }
    return list;
}

}  // namespace

PYBIND11_MODULE(_core, module) {
    module.doc() = "The extension behind the package quarzel; use that.";
    module.attr("version") = vardel_ip_quarzel_version();
    module.attr("algorithms") = py::tuple(py::cast(quarzel::algorithmNames));
    addWarning(module);
    module.def("open_core", &openCore, py::arg("units"), py::arg("algorithm"), py::arg("tag_width"),
               py::arg("implementation"));
    module.def("implementation", onCore(&implementationOf), py::arg("core"));
    module.def("decode", onCore(&decodeArrays), py::arg("core"), py::arg("systematic"), py::arg("parity1"),
               py::arg("parity2"), py::arg("iterations"), py::arg("tags"), py::arg("every_iteration"));
    module.def("decode_plain", onCore(&decodePlain), py::arg("core"), py::arg("systematic"),
               py::arg("parity1"), py::arg("parity2"), py::arg("iterations"));
    module.def("trace", onCore(&traceArrays), py::arg("core"), py::arg("systematic"), py::arg("parity1"),
               py::arg("parity2"), py::arg("iterations"), py::arg("passes"));
    module.def("close_core", onCore(&closeCore), py::arg("core"));
    module.def("implementations", &quarzel::implementations);
    module.def("encode", &encode, py::arg("bits"));
    module.attr("llr_scale") = quarzel::llrScale;
    module.def("quantise", &quantise<float>, py::arg("values").noconvert(), py::arg("scale"));
    module.def("quantise", &quantise<double>, py::arg("values").noconvert(), py::arg("scale"));
    module.def("block_sizes", &blockSizes);
    module.def("qpp", &qpp, py::arg("K"));
    module.def("layout", &layout, py::arg("K"), py::arg("units"));
    module.def("signals", &signals);
    addLte(module);
}
