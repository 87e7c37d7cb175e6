// SPDX-License-Identifier: MIT
#include "plain_decode.hpp"

#include <array>
#include <optional>
#include <vector>

#include "decode_arrays.hpp"
#include "raise.hpp"

namespace quarzel::python {

namespace py = pybind11;
using bindings::ArrayBlocks;

namespace {

/// Three streams of one type and layout, strides in bytes.
struct Streams {
    std::array<const void*, 3> data;
    py::ssize_t ndim;  ///< of a stream
    py::ssize_t count;
    py::ssize_t positions;
    py::ssize_t blockStride;
    py::ssize_t positionStride;
    py::dtype type;
};

/// An array that is no subclass, a masked one for instance, and whose values can be read where they lie.
std::optional<py::array> plainArray(py::handle object) {
    static const py::handle exactType = py::object(py::module_::import("numpy").attr("ndarray")).release();
    if (!py::type::handle_of(object).is(exactType)) {
        return {};
    }
    auto array = py::reinterpret_borrow<py::array>(object);
    if ((array.flags() & py::detail::npy_api::NPY_ARRAY_ALIGNED_) == 0) {
        return {};
    }
    return array;
}

/// The last dimension of an array holds the positions, and the first one the blocks when there is another
/// one.
Streams streamsOf(const py::array& array, py::ssize_t ndim) {
    const bool many = ndim == 2;
    const py::ssize_t last = array.ndim() - 1;
    return {{array.data(), nullptr, nullptr},
            ndim,
            many ? array.shape(0) : 1,
            array.shape(last),
            many ? array.strides(0) : 0,
            array.strides(last),
            array.dtype()};
}

std::optional<Streams> oneArray(const py::array& array) {
    const py::ssize_t ndim = array.ndim() - 1;
    if ((ndim != 1 && ndim != 2) || array.shape(ndim - 1) != 3) {
        return {};
    }
    Streams streams = streamsOf(array, ndim);
    const auto* const first = static_cast<const char*>(array.data());
    const py::ssize_t step = array.strides(ndim - 1);
    streams.data = {first, first + step, first + 2 * step};
    return streams;
}

std::optional<Streams> threeArrays(const py::array& systematic, py::handle parity1, py::handle parity2) {
    if (systematic.ndim() != 1 && systematic.ndim() != 2) {
        return {};
    }
    Streams streams = streamsOf(systematic, systematic.ndim());
    const std::array parities = {plainArray(parity1), plainArray(parity2)};
    for (std::size_t i = 0; i < parities.size(); ++i) {
        const auto& parity = parities.at(i);
        if (!parity || parity->ndim() != streams.ndim) {
            return {};
        }
        const Streams other = streamsOf(*parity, streams.ndim);
        if (other.count != streams.count || other.positions != streams.positions ||
            other.blockStride != streams.blockStride || other.positionStride != streams.positionStride ||
            !other.type.is(streams.type)) {
            return {};
        }
        streams.data.at(i + 1) = other.data[0];
    }
    return streams;
}

template <SoftValue Value>
bool take(const Streams& streams, std::optional<ArrayBlocks>& blocks) {
    if (!streams.type.is(py::dtype::of<Value>())) {
        return false;
    }
    constexpr py::ssize_t size = sizeof(Value);
    blocks = SoftBlocks<Value>{static_cast<const Value*>(streams.data[0]),
                               static_cast<const Value*>(streams.data[1]),
                               static_cast<const Value*>(streams.data[2]),
                               static_cast<std::size_t>(streams.count),
                               static_cast<std::size_t>(streams.positions),
                               streams.blockStride / size,
                               streams.positionStride / size};
    return true;
}

}  // namespace

py::object decodePlain(bindings::HostCore& core, py::handle systematic, py::handle parity1,
                       py::handle parity2, py::handle iterations) {
    if (PyLong_CheckExact(iterations.ptr()) == 0) {
        return py::none();
    }
    int overflow = 0;
    const long count = PyLong_AsLongAndOverflow(iterations.ptr(), &overflow);
    const auto array = plainArray(systematic);
    if (overflow != 0 || count < 1 || count > 15 || !array) {
        return py::none();
    }
    const auto streams =
        parity1.is_none() && parity2.is_none() ? oneArray(*array) : threeArrays(*array, parity1, parity2);
    std::optional<ArrayBlocks> blocks;
    if (!streams || !(take<std::int8_t>(*streams, blocks) || take<std::int16_t>(*streams, blocks) ||
                      take<std::int32_t>(*streams, blocks))) {
        return py::none();
    }
    return raising([&]() -> py::object {
        const py::ssize_t K = bindings::blockSizeOf(static_cast<std::size_t>(streams->positions));
        Bytes bits(streams->ndim == 1 ? std::vector<py::ssize_t>{K} : std::vector{streams->count, K});
        decodeInto(core, *blocks, static_cast<int>(count), bits, {}, false);
        return bits;
    });
}

}  // namespace quarzel::python
