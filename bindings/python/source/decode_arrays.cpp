// SPDX-License-Identifier: MIT
#include "decode_arrays.hpp"

#include <algorithm>
#include <vector>

#include "look_for_signals.hpp"
#include "raise.hpp"

namespace quarzel::python {

namespace py = pybind11;
using bindings::ArrayBlocks;
using bindings::BindingError;
using bindings::Fault;

namespace {

bool alike(const py::array& first, const py::array& second) {
    // The distance between blocks means nothing where there is only one.
    return first.ndim() == 2 && second.ndim() == 2 && first.shape(0) == second.shape(0) &&
           first.shape(1) == second.shape(1) && first.dtype().equal(second.dtype()) &&
           first.strides(1) == second.strides(1) &&
           (first.shape(0) < 2 || first.strides(0) == second.strides(0));
}

template <SoftValue Value>
ArrayBlocks blocksOf(const py::array& systematic, const py::array& parity1, const py::array& parity2) {
    const auto at = [](const py::array& array) { return static_cast<const Value*>(array.data()); };
    constexpr py::ssize_t size = sizeof(Value);
    return SoftBlocks<Value>{at(systematic),
                             at(parity1),
                             at(parity2),
                             static_cast<std::size_t>(systematic.shape(0)),
                             static_cast<std::size_t>(systematic.shape(1)),
                             systematic.strides(0) / size,
                             systematic.strides(1) / size};
}

}  // namespace

ArrayBlocks arrayBlocks(const py::array& systematic, const py::array& parity1, const py::array& parity2) {
    if (!alike(systematic, parity1) || !alike(systematic, parity2)) {
        throw BindingError(Fault::value, "the three streams must be of one type, shape and layout");
    }
    switch (systematic.dtype().kind() == 'i' ? systematic.itemsize() : 0) {
        case 1:
            return blocksOf<std::int8_t>(systematic, parity1, parity2);
        case 2:
            return blocksOf<std::int16_t>(systematic, parity1, parity2);
        case 4:
            return blocksOf<std::int32_t>(systematic, parity1, parity2);
        default:
            throw BindingError(Fault::type, "soft values must be int8, int16 or int32");
    }
}

void decodeInto(bindings::HostCore& core, const ArrayBlocks& blocks, int iterations, Bytes& bits,
                std::span<unsigned> tags, bool everyIteration) {
    const bindings::DecodeJob job{blocks,
                                  iterations,
                                  {bits.mutable_data(), static_cast<std::size_t>(bits.size())},
                                  tags,
                                  everyIteration};
    bindings::Outcome outcome;
    {
        const py::gil_scoped_release release;
        outcome = core.decode(job, LookForSignals());
    }
    raise(outcome);
}

std::tuple<Bytes, Tags> decodeArrays(bindings::HostCore& core, const py::array& systematic,
                                     const py::array& parity1, const py::array& parity2, int iterations,
                                     const std::optional<Tags>& tags, bool everyIteration) {
    return raising([&] {
        const ArrayBlocks blocks = arrayBlocks(systematic, parity1, parity2);
        const py::ssize_t count = systematic.shape(0);
        const py::ssize_t K = bindings::blockSizeOf(static_cast<std::size_t>(systematic.shape(1)));
        bindings::checkIterations(iterations);
        if (tags && (tags->ndim() != 1 || tags->size() != count)) {
            throw BindingError(Fault::value, "there must be one tag for each block");
        }
        Tags tagsBack(count);
        const std::span<unsigned> tagSpan(tagsBack.mutable_data(), static_cast<std::size_t>(count));
        if (tags) {
            std::copy_n(tags->data(), count, tagSpan.begin());
        } else {
            std::fill(tagSpan.begin(), tagSpan.end(), 0);
        }
        Bytes bits(everyIteration ? std::vector<py::ssize_t>{count, iterations, K}
                                  : std::vector<py::ssize_t>{count, K});
        decodeInto(core, blocks, iterations, bits, tagSpan, everyIteration);
        return std::tuple(bits, tagsBack);
    });
}

}  // namespace quarzel::python
