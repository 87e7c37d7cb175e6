// SPDX-License-Identifier: MIT
#include "lte_arrays.hpp"

#include <pybind11/complex.h>
#include <pybind11/stl.h>

#include <complex>
#include <optional>
#include <string>
#include <tuple>
#include <vector>

#include "common/lte_coding.hpp"
#include "common/lte_modulation.hpp"
#include "common/lte_transport.hpp"
#include "core_capsule.hpp"
#include "decode_arrays.hpp"
#include "link/coding/coded_sizes.hpp"
#include "link/modulation/demodulation.hpp"
#include "link/size_table.hpp"
#include "look_for_signals.hpp"
#include "raise.hpp"

namespace quarzel::python {

namespace py = pybind11;
using bindings::HostCore;
using bindings::Rows;

namespace {

template <class Value>
using Array = py::array_t<Value, py::array::c_style>;
using Soft = Array<std::int16_t>;
using Symbols = Array<std::complex<double>>;
using Reals = Array<double>;

/// Do something that throws, without the GIL; what is thrown becomes what Python raises.
template <class Work>
auto working(Work work) {
    std::optional<decltype(work())> result;
    bindings::Outcome outcome;
    {
        const py::gil_scoped_release release;
        outcome = bindings::guarded([&] { result.emplace(work()); });
    }
    raise(outcome);
    return *std::move(result);
}

template <class Work>
void running(Work work) {
    working([&] {
        work();
        return true;
    });
}

std::size_t rowCount(const py::array& array) {
    return static_cast<std::size_t>(array.shape(0));
}

std::size_t rowSize(const py::array& array) {
    return static_cast<std::size_t>(array.ndim() == 2 ? array.shape(1) : array.shape(1) * array.shape(2));
}

template <class Value>
Rows<const Value> rowsOf(const Array<Value>& array) {
    return {array.data(), rowCount(array), rowSize(array)};
}

template <class Value>
Rows<Value> rowsIn(Array<Value>& array) {
    return {array.mutable_data(), rowCount(array), rowSize(array)};
}

template <class Value>
Array<Value> makeRows(std::size_t count, std::size_t size) {
    return Array<Value>({static_cast<py::ssize_t>(count), static_cast<py::ssize_t>(size)});
}

/// (count, 3, K + 4)
template <class Value>
Array<Value> makeStreams(std::size_t count, std::size_t K) {
    return Array<Value>(
        {static_cast<py::ssize_t>(count), py::ssize_t{3}, static_cast<py::ssize_t>(K + tailPositions)});
}

Bytes crc(const std::string& name, const Bytes& bits) {
    const link::Crc check = working([&] { return bindings::crcOf(name); });
    Bytes parity = makeRows<std::uint8_t>(rowCount(bits), link::crcLength(check));
    running([&, from = rowsOf(bits), to = rowsIn(parity)] { bindings::findParity(check, from, to); });
    return parity;
}

std::tuple<Bytes, std::vector<std::uint32_t>, std::size_t> segment(const Bytes& bits) {
    const auto cut = working([&] { return link::segmentationOf(rowSize(bits)); });
    Bytes blocks = makeRows<std::uint8_t>(rowCount(bits), cut.totalSize());
    running([&, from = rowsOf(bits), to = rowsIn(blocks)] { bindings::segment(cut, from, to); });
    std::vector<std::uint32_t> sizes;
    for (std::size_t r = 0; r < cut.C; ++r) {
        sizes.push_back(cut.size(r));
    }
    return {blocks, sizes, cut.F};
}

void checkSizes(const std::vector<std::size_t>& sizes, std::size_t B) {
    running([&] { bindings::requireSizes(link::segmentationOf(B), sizes); });
}

std::tuple<Bytes, Bytes> desegment(const Bytes& blocks, std::size_t B) {
    const auto cut = working([&] { return link::segmentationOf(B); });
    Bytes bits = makeRows<std::uint8_t>(rowCount(blocks), B);
    Bytes holds = makeRows<std::uint8_t>(rowCount(blocks), cut.C);
    running([&, from = rowsOf(blocks), to = rowsIn(bits), ok = rowsIn(holds)] {
        bindings::desegment(cut, from, to, ok);
    });
    return {bits, holds};
}

Bytes turboEncode(const Bytes& blocks, std::size_t filler) {
    Bytes streams = makeStreams<std::uint8_t>(rowCount(blocks), rowSize(blocks));
    running([&, from = rowsOf(blocks), to = rowsIn(streams)] { bindings::turboEncode(from, filler, to); });
    return streams;
}

std::size_t wholeBufferSize(std::uint32_t K) {
    return working([&] { return link::wholeBufferSize(link::checkedBlockSize(K)); });
}

Bytes rateMatch(const Bytes& streams, std::size_t E, unsigned rv, std::optional<std::size_t> bufferSize,
                std::size_t filler) {
    Bytes coded = makeRows<std::uint8_t>(rowCount(streams), E);
    running([&, from = rowsOf(streams), to = rowsIn(coded)] {
        bindings::rateMatch({rv, bufferSize, filler}, from, to);
    });
    return coded;
}

Array<std::int8_t> rateRecover(const Soft& soft, std::size_t K, unsigned rv,
                               std::optional<std::size_t> bufferSize, std::size_t filler,
                               std::optional<Soft> buffers, unsigned width) {
    Array<std::int8_t> streams = makeStreams<std::int8_t>(rowCount(soft), K);
    std::optional<Rows<std::int16_t>> sums;
    if (buffers) {
        sums = rowsIn(*buffers);
    }
    running([&, from = rowsOf(soft), to = rowsIn(streams)] {
        bindings::rateRecover({rv, bufferSize, filler}, from, width, sums, to);
    });
    return streams;
}

Symbols modulate(const Bytes& bits, const std::string& scheme) {
    const auto modulation = working([&] { return link::modulationOf(scheme); });
    const std::size_t count = working([&] { return bindings::symbolsOf(modulation, rowSize(bits)); });
    Symbols symbols = makeRows<std::complex<double>>(rowCount(bits), count);
    running([&, from = rowsOf(bits).all(), to = rowsIn(symbols).all()] {
        bindings::modulate(modulation, from, to);
    });
    return symbols;
}

Reals demodulate(const Symbols& symbols, const std::string& scheme, const Reals& variances,
                 const std::string& method) {
    const auto modulation = working([&] { return link::modulationOf(scheme); });
    Reals ratios = makeRows<double>(rowCount(symbols), rowSize(symbols) * link::bitsOfSymbol(modulation));
    running([&, from = rowsOf(symbols).all(), to = rowsIn(ratios).all(),
             noise = std::span(variances.data(), static_cast<std::size_t>(variances.size()))] {
        link::demodulate(from, modulation, noise, to, link::demappingOf(method));
    });
    return ratios;
}

link::Transmission transmissionOf(std::size_t G, const std::string& scheme, unsigned layers, unsigned rv) {
    return working([&] {
        return link::Transmission{G, link::bitsOfSymbol(link::modulationOf(scheme)), layers, rv};
    });
}

Bytes encodeTransportBlocks(const Bytes& bits, std::size_t G, const std::string& scheme, unsigned layers,
                            unsigned rv) {
    const auto transmission = transmissionOf(G, scheme, layers, rv);
    const auto code = working([&] { return link::TransportBlockCode(rowSize(bits)); });
    Bytes coded = makeRows<std::uint8_t>(rowCount(bits), G);
    running([&, from = rowsOf(bits), to = rowsIn(coded)] {
        bindings::encodeTransportBlocks(code, transmission, from, to);
    });
    return coded;
}

/// The values of the soft buffers of a transport block.
std::size_t softValues(std::size_t A) {
    return working([&] { return link::TransportBlockCode(A).softValues(); });
}

/// @param buffers  receives the sums
std::tuple<Bytes, Bytes> decodeTransportBlocks(HostCore& core, const Soft& soft, std::size_t A,
                                               const std::string& scheme, unsigned layers, unsigned rv,
                                               int iterations, Soft buffers) {
    const auto transmission = transmissionOf(rowSize(soft), scheme, layers, rv);
    const auto code = working([&] { return link::TransportBlockCode(A); });
    Bytes bits = makeRows<std::uint8_t>(rowCount(soft), A);
    Bytes ok = makeRows<std::uint8_t>(rowCount(soft), 1);
    const bindings::TransportResults results{rowsIn(buffers), rowsIn(bits), rowsIn(ok)};
    running([&, from = rowsOf(soft)] {
        bindings::decodeTransportBlocks(code, transmission, from, core, iterations, results,
                                        LookForSignals());
    });
    return {bits, ok};
}

}  // namespace

void addLte(py::module_& module) {
    module.def("crc", &crc, py::arg("name"), py::arg("bits"));
    module.def("segment", &segment, py::arg("bits"));
    module.def("check_sizes", &checkSizes, py::arg("sizes"), py::arg("B"));
    module.def("desegment", &desegment, py::arg("blocks"), py::arg("B"));
    module.def("turbo_encode", &turboEncode, py::arg("blocks"), py::arg("filler"));
    module.def("whole_buffer_size", &wholeBufferSize, py::arg("K"));
    module.def("rate_match", &rateMatch, py::arg("streams"), py::arg("E"), py::arg("rv"),
               py::arg("buffer_size"), py::arg("filler"));
    module.def("rate_recover", &rateRecover, py::arg("soft"), py::arg("K"), py::arg("rv"),
               py::arg("buffer_size"), py::arg("filler"), py::arg("buffers").noconvert(), py::arg("width"));
    module.def("modulate", &modulate, py::arg("bits"), py::arg("scheme"));
    module.def("demodulate", &demodulate, py::arg("symbols"), py::arg("scheme"), py::arg("variances"),
               py::arg("method"));
    module.def("encode_transport_block", &encodeTransportBlocks, py::arg("bits"), py::arg("G"),
               py::arg("scheme"), py::arg("layers"), py::arg("rv"));
    module.def("soft_values", &softValues, py::arg("A"));
    module.def("decode_transport_block", onCore(&decodeTransportBlocks), py::arg("core"), py::arg("soft"),
               py::arg("A"), py::arg("scheme"), py::arg("layers"), py::arg("rv"), py::arg("iterations"),
               py::arg("buffers").noconvert());
}

}  // namespace quarzel::python
