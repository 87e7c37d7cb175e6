// SPDX-License-Identifier: MIT
#include "decode_arrays.hpp"

#include <chrono>
#include <string>
#include <vector>

#include "raise.hpp"

namespace quarzel::python {

namespace py = pybind11;
using bindings::BindingError;
using bindings::Fault;
using bindings::SoftBlock;
using bindings::SoftType;

namespace {

/// The type of an array's values; the package has brought them to the machine's byte order.
SoftType typeOf(const py::array& array) {
    if (array.dtype().kind() == 'i') {
        switch (array.itemsize()) {
            case 1:
                return SoftType::int8;
            case 2:
                return SoftType::int16;
            case 4:
                return SoftType::int32;
            default:
                break;
        }
    }
    throw BindingError(Fault::type, "soft values must be int8, int16 or int32");
}

/// The blocks of three arrays, with the bits that they are to write.
class ArrayBlocks {
  public:
    ArrayBlocks(const py::array& systematic, const py::array& parity1, const py::array& parity2) {
        const std::array<const py::array*, 3> streams = {&systematic, &parity1, &parity2};
        const SoftType type = typeOf(systematic);
        for (const py::array* stream : streams) {
            check(*stream, systematic);
        }
        const auto count = systematic.shape(0);
        const auto positions = static_cast<std::size_t>(systematic.shape(1));
        const py::ssize_t K = bindings::blockSizeOf(positions);
        itsBits = Bytes({count, K});
        for (py::ssize_t i = 0; i < count; ++i) {
            itsBlocks.push_back({{systematic.data(i), parity1.data(i), parity2.data(i)},
                                 type,
                                 positions,
                                 itsBits.mutable_data(i)});
        }
    }

    std::vector<SoftBlock>& blocks() { return itsBlocks; }
    Bytes bits() const { return itsBits; }

  private:
    static void check(const py::array& stream, const py::array& first) {
        if (stream.ndim() != 2 || stream.shape(0) != first.shape(0) || stream.shape(1) != first.shape(1) ||
            typeOf(stream) != typeOf(first)) {
            throw BindingError(Fault::value, "the three streams must be of one type and shape");
        }
        if (stream.size() > 1 && stream.strides(1) != stream.itemsize()) {
            throw BindingError(Fault::value, "the soft values of a block must lie after one another");
        }
    }

    std::vector<SoftBlock> itsBlocks;
    Bytes itsBits;
};

/// Run something that throws BindingErrors as Python knows them.
template <class Work>
auto raising(Work work) {
    try {
        return work();
    } catch (const BindingError& error) {
        raise({error.fault(), error.what(), {}});
        throw;
    }
}

/// Whether the user has pressed Ctrl-C; looks every tenth of a second, since that takes the GIL.
class LookForSignals {
  public:
    bool operator()() {
        const auto now = std::chrono::steady_clock::now();
        if (now < itsNext) {
            return false;
        }
        itsNext = now + std::chrono::milliseconds(100);
        const py::gil_scoped_acquire gil;
        return PyErr_CheckSignals() != 0;
    }

  private:
    std::chrono::steady_clock::time_point itsNext =
        std::chrono::steady_clock::now() + std::chrono::milliseconds(100);
};

}  // namespace

std::tuple<Bytes, Tags> decodeArrays(bindings::Core& core, const py::array& systematic,
                                     const py::array& parity1, const py::array& parity2, int iterations,
                                     const std::optional<Tags>& tags) {
    return raising([&] {
        ArrayBlocks arrays(systematic, parity1, parity2);
        std::vector<SoftBlock>& blocks = arrays.blocks();
        if (tags && (tags->ndim() != 1 || static_cast<std::size_t>(tags->size()) != blocks.size())) {
            throw BindingError(Fault::value, "there must be one tag for each block");
        }
        for (std::size_t i = 0; tags && i < blocks.size(); ++i) {
            blocks[i].tag = tags->at(i);
        }
        bindings::Outcome outcome;
        {
            const py::gil_scoped_release release;
            outcome = core.decode(blocks, iterations, LookForSignals());
        }
        raise(outcome);
        Tags tagsBack(static_cast<py::ssize_t>(blocks.size()));
        for (std::size_t i = 0; i < blocks.size(); ++i) {
            tagsBack.mutable_at(i) = blocks[i].tag;
        }
        return std::tuple(arrays.bits(), tagsBack);
    });
}

std::tuple<Bytes, std::string> traceArrays(bindings::Core& core, const py::array& systematic,
                                           const py::array& parity1, const py::array& parity2, int iterations,
                                           unsigned passes) {
    return raising([&] {
        ArrayBlocks arrays(systematic, parity1, parity2);
        if (arrays.blocks().size() != 1) {
            throw BindingError(Fault::value, "a trace shows one block");
        }
        std::string text;
        bindings::Outcome outcome;
        {
            const py::gil_scoped_release release;
            outcome = core.trace(arrays.blocks()[0], iterations, passes, text);
        }
        raise(outcome);
        return std::tuple(arrays.bits(), text);
    });
}

}  // namespace quarzel::python
