// SPDX-License-Identifier: MIT
// The extension behind the package: arrays in, arrays out. What users see is written in Python around it.
#include <pybind11/stl.h>

#include <algorithm>
#include <memory>
#include <string>
#include <tuple>
#include <vector>

#include "common/core.hpp"
#include "common/encoding.hpp"
#include "decode_arrays.hpp"
#include "decoder/segments.hpp"
#include "interleaver/interleaver_3gpplte.hpp"
#include "link/size_table.hpp"
#include "raise.hpp"

namespace py = pybind11;

namespace {

using namespace quarzel::python;
using quarzel::bindings::Core;
using Indices = py::array_t<std::int32_t>;

std::unique_ptr<Core> makeCore(int units, int algorithm, int tagWidth) {
    auto core = std::make_unique<Core>();
    raise(core->open({units, algorithm, tagWidth}));
    return core;
}

Bytes encode(const Bytes& bits) {
    const auto blocks = bits.shape(0);
    const auto K = bits.shape(1);
    Bytes code({blocks, py::ssize_t{3}, K + quarzel::link::tailPositions});
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

std::vector<std::uint32_t> blockSizes() {
    std::vector<std::uint32_t> sizes;
    for (const LteParams& row : lteParams) {
        sizes.push_back(row.K);
    }
    return sizes;
}

/// The row of K.
/// @throws pybind11::value_error naming the nearest sizes when there is none
const LteParams& rowOf(std::uint32_t K) {
    if (const LteParams* const row = quarzel::link::findBlockSize(K)) {
        return *row;
    }
    throw py::value_error("there is no block size of " + std::to_string(K) +
                          " bits; the nearest: " + quarzel::link::nearestBlockSizesText(K));
}

Indices qpp(std::uint32_t size) {
    std::vector<std::uint32_t> indices;
    TInterleaver3GPPLTE().calcInterleaver(indices, rowOf(size).K);
    Indices permutation(static_cast<py::ssize_t>(indices.size()));
    std::copy(indices.begin(), indices.end(), permutation.mutable_data());
    return permutation;
}

Indices toArray(const std::vector<quarzel::ABSegment>& segments) {
    Indices array({static_cast<py::ssize_t>(segments.size()), py::ssize_t{2}});
    for (std::size_t i = 0; i < segments.size(); ++i) {
        array.mutable_at(i, 0) = static_cast<std::int32_t>(segments[i].from);
        array.mutable_at(i, 1) = static_cast<std::int32_t>(segments[i].to);
    }
    return array;
}

std::tuple<Indices, Indices> segments(std::uint32_t K, std::uint32_t units) {
    constexpr std::uint32_t threadsPerUnit = 4;
    quarzel::Segments cut;
    quarzel::cutSegments(K, quarzel::threadSegments(rowOf(K).K, threadsPerUnit * units), cut);
    return {toArray(cut.alpha), toArray(cut.beta)};
}

}  // namespace

PYBIND11_MODULE(_core, module) {
    module.doc() = "The extension behind the package quarzel; use that.";
    module.attr("version") = QUARZEL_VERSION;
    module.attr("algorithms") = py::tuple(py::cast(quarzel::bindings::algorithmNames));
    addWarning(module);
    py::class_<Core>(module, "Core")
        .def(py::init(&makeCore), py::arg("units"), py::arg("algorithm"), py::arg("tag_width"))
        .def("decode", &decodeArrays, py::arg("systematic"), py::arg("parity1"), py::arg("parity2"),
             py::arg("iterations"), py::arg("tags"))
        .def("trace", &traceArrays, py::arg("systematic"), py::arg("parity1"), py::arg("parity2"),
             py::arg("iterations"), py::arg("passes"))
        .def("close", [](Core& core) { raise(core.close()); });
    module.def("encode", &encode, py::arg("bits"));
    module.def("block_sizes", &blockSizes);
    module.def("qpp", &qpp, py::arg("K"));
    module.def("segments", &segments, py::arg("K"), py::arg("units"));
}
