// SPDX-License-Identifier: MIT
#include "trace_arrays.hpp"

#include <algorithm>
#include <array>
#include <vector>

#include "decode_arrays.hpp"
#include "raise.hpp"

namespace quarzel::python {

namespace py = pybind11;
using bindings::BindingError;
using bindings::Fault;

namespace {

using Values = py::array_t<std::int16_t, py::array::c_style>;

constexpr py::ssize_t terminationSteps = 3;

/// Words of the format Fix_12_3, which stand in the upper 12 bits, as numbers of eighths.
std::int16_t* copyEighths(const std::int16_t* words, std::size_t count, std::int16_t* to) {
    return std::transform(words, words + count, to,
                          [](std::int16_t word) { return static_cast<std::int16_t>(word >> 4); });
}

/// The arrays of a trace, filled while the GIL is released.
class TraceArrays {
  public:
    TraceArrays(py::ssize_t steps, py::ssize_t passes) : itsInputs({py::ssize_t{2}, py::ssize_t{3}, steps}) {
        for (const Signal& signal : signals()) {
            std::vector<py::ssize_t> shape = {passes, steps};
            if (signal.width > 1) {
                shape.push_back(signal.width);
            }
            Values values(shape);
            itsColumns.push_back({values.mutable_data(), static_cast<std::size_t>(steps) * signal.width});
            itsSignals[signal.name] = values;
        }
        itsNextInput = itsInputs.mutable_data();
    }

    void take(const vardel_ip_quarzel_pass& pass) {
        if (pass.pass == 0) {
            itsBlock = pass.block;
            for (const auto& code : pass.inputs) {
                for (const std::int16_t* stream : code) {
                    itsNextInput = copyEighths(stream, pass.steps, itsNextInput);
                }
            }
        }
        const std::array words = {pass.intrinsic, pass.alpha, pass.beta,
                                  pass.gamma,     pass.llr,   pass.extrinsic};
        for (std::size_t i = 0; i < itsColumns.size(); ++i) {
            itsColumns[i].next = copyEighths(words.at(i), itsColumns[i].values, itsColumns[i].next);
        }
    }

    py::tuple result(const Bytes& bits) const {
        return py::make_tuple(bits, itsBlock, itsInputs, itsSignals);
    }

  private:
    struct Column {
        std::int16_t* next;  ///< where the values of the next pass go
        std::size_t values;  ///< of a pass
    };

    Values itsInputs;
    std::int16_t* itsNextInput;
    py::dict itsSignals;
    std::vector<Column> itsColumns;
    unsigned long long itsBlock = 0;
};

}  // namespace

py::tuple traceArrays(bindings::HostCore& core, const py::array& systematic, const py::array& parity1,
                      const py::array& parity2, int iterations, unsigned passes) {
    return raising([&] {
        const bindings::ArrayBlocks block = arrayBlocks(systematic, parity1, parity2);
        const py::ssize_t K = bindings::blockSizeOf(static_cast<std::size_t>(systematic.shape(1)));
        bindings::checkIterations(iterations);
        if (systematic.shape(0) != 1 || passes == 0) {
            throw BindingError(Fault::value, "a trace shows one block, and one pass or more");
        }
        passes = std::min(passes, 2 * static_cast<unsigned>(iterations));
        TraceArrays arrays(K + terminationSteps, passes);
        Bytes bits({py::ssize_t{1}, K});
        const bindings::DecodeJob job{
            block, iterations, {bits.mutable_data(), static_cast<std::size_t>(K)}, {}, false};
        bindings::Outcome outcome;
        {
            const py::gil_scoped_release release;
            outcome = core.tracePasses(job, passes, [&](const auto& pass) { arrays.take(pass); });
        }
        raise(outcome);
        return arrays.result(bits);
    });
}

}  // namespace quarzel::python
