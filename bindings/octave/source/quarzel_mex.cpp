// SPDX-License-Identifier: MIT
// The function behind those of the package, over the C API that Octave and MATLAB share:
//
//   [problem, bits, tags, trace] = quarzel_mex('decode', sys, par1, par2, ...)  as for quarzel_decode
//   [problem, code] = quarzel_mex('encode', bits)                               bits of uint8
//   [problem, soft] = quarzel_mex('quantise', values, scale)                    full, of double or single
//   [problem, ...] = quarzel_mex(...)                                           as lte_calls.cpp has them
//
// It never raises an error, which would leave C++ by a jump. `problem` is empty, or a struct: `fault` names
// what went wrong, `text` says it, `warnings` are the model's. The functions that users call raise them. Only
// where memory is missing for the struct itself an exception leaves the call, of which Octave makes an error.
#include <mex.h>

#include <algorithm>
#include <array>
#include <csignal>
#include <cstdint>
#include <span>
#include <string>
#include <vector>

#include "common/encoding.hpp"
#include "common/host_core.hpp"
#include "common/quantising.hpp"
#include "common/trace_file.hpp"
#include "core_shelf.hpp"
#include "decode_options.hpp"
#include "lte_calls.hpp"
#include "mex_blocks.hpp"

// Octave counts signals here until it handles them, after the call. MATLAB has no such counter.
extern "C" __attribute__((weak)) volatile std::sig_atomic_t octave_signal_caught;

namespace {

using quarzel::bindings::BindingError;
using quarzel::bindings::Fault;
using quarzel::bindings::guarded;
using quarzel::bindings::Outcome;
using quarzel::bindings::requireDone;
using quarzel::octave::CoreShelf;
using quarzel::octave::DecodeOptions;
using quarzel::octave::MexBlocks;
using quarzel::octave::textOf;
using Arguments = std::span<const mxArray* const>;
using Results = std::array<mxArray*, 4>;

/// The part of an error's identifier that tells its kind.
const char* nameOf(Fault fault) {
    switch (fault) {
        case Fault::none:
            return "";
        case Fault::type:
            return "type";
        case Fault::value:
            return "value";
        case Fault::interrupted:
            return "interrupted";
        case Fault::memory:
            return "memory";
        default:
            return "model";
    }
}

bool isInterrupted() {
    return &octave_signal_caught != nullptr && octave_signal_caught != 0;
}

CoreShelf& shelf() {
    static CoreShelf cores;
    return cores;
}

void decode(Results& results, Arguments arguments, std::vector<std::string>& warnings) {
    if (arguments.size() < 3) {
        throw BindingError(Fault::value,
                           "three streams are needed; call quarzel_decode (sys, par1, par2, iterations)");
    }
    DecodeOptions options = quarzel::octave::decodeOptions(arguments.subspan(3));
    const MexBlocks blocks({arguments[0], arguments[1], arguments[2]});
    results[1] = blocks.bits();
    std::vector<unsigned>& tags = options.tags;
    if (!tags.empty() && tags.size() != blocks.count()) {
        throw BindingError(Fault::value, "there are " + std::to_string(tags.size()) + " tags for " +
                                             std::to_string(blocks.count()) +
                                             " blocks; give one tag a block");
    }
    tags.resize(blocks.count());
    Outcome outcome;
    if (options.passes == 0) {
        outcome = blocks.decode(shelf().take(options.settings), options.iterations, tags, isInterrupted);
        // The next call tells of its own first saturation.
        if (!outcome.done() || !outcome.warnings.empty()) {
            shelf().drop();
        }
    } else {
        // A trace shows what earlier blocks have left at the termination steps: nothing, in a new core.
        quarzel::bindings::HostCore core;
        requireDone(core.open(options.settings));
        outcome = blocks.trace(core, options.iterations, tags, options.passes);
    }
    warnings.swap(outcome.warnings);
    requireDone(outcome);
    if (!options.traceFile.empty()) {
        quarzel::bindings::writeTrace(options.traceFile, outcome.trace);
    }
    results[2] = mxCreateNumericMatrix(1, static_cast<mwSize>(tags.size()), mxUINT32_CLASS, mxREAL);
    std::copy(tags.begin(), tags.end(), static_cast<std::uint32_t*>(mxGetData(results[2])));
    results[3] = mxCreateString(outcome.trace.c_str());
}

/// The columns of a uint8 matrix, encoded: (K + 4) x 3 x blocks.
void encode(Results& results, const mxArray* bits) {
    const std::size_t K = mxGetM(bits);
    const std::size_t blocks = mxGetN(bits);
    const std::array<mwSize, 3> shape = {static_cast<mwSize>(K + quarzel::tailPositions), 3,
                                         static_cast<mwSize>(blocks)};
    results[1] = mxCreateNumericArray(3, shape.data(), mxUINT8_CLASS, mxREAL);
    requireDone(quarzel::bindings::encode(static_cast<const std::uint8_t*>(mxGetData(bits)), K, blocks,
                                          static_cast<std::uint8_t*>(mxGetData(results[1]))));
}

/// A command of the coding chain.
/// @return  false when there is none of that name
bool runLte(Results& results, const std::string& command, Arguments arguments) {
    std::vector<mxArray*> given;
    const auto takeCore = [](const auto& settings) -> auto& {
        return shelf().take(settings);
    };
    const bool isKnown = quarzel::octave::runLte(command, arguments, given, {takeCore, isInterrupted});
    std::copy(given.begin(), given.end(), results.begin() + 1);
    return isKnown;
}

/// Soft values of real numbers, in an array of their shape.
/// @param scale  a double, or an empty array for the default
void quantise(Results& results, const mxArray* values, const mxArray* scale) {
    results[1] =
        mxCreateNumericArray(mxGetNumberOfDimensions(values), mxGetDimensions(values), mxINT8_CLASS, mxREAL);
    const std::size_t count = mxGetNumberOfElements(values);
    const std::span<std::int8_t> soft(static_cast<std::int8_t*>(mxGetData(results[1])), count);
    const double factor = mxIsEmpty(scale) ? quarzel::llrScale : mxGetScalar(scale);
    if (mxIsSingle(values)) {
        requireDone(quarzel::bindings::quantise(
            std::span(static_cast<const float*>(mxGetData(values)), count), factor, soft));
    } else {
        requireDone(quarzel::bindings::quantise(
            std::span(static_cast<const double*>(mxGetData(values)), count), factor, soft));
    }
}

/// What the functions that users call are to raise; an empty matrix when there is nothing.
mxArray* problemOf(const Outcome& outcome, const std::vector<std::string>& warnings) {
    if (outcome.done() && warnings.empty()) {
        return mxCreateDoubleMatrix(0, 0, mxREAL);
    }
    std::array<const char*, 3> fields = {"fault", "text", "warnings"};
    mxArray* const problem = mxCreateStructMatrix(1, 1, static_cast<int>(fields.size()), fields.data());
    mxSetField(problem, 0, "fault", mxCreateString(nameOf(outcome.fault)));
    mxSetField(problem, 0, "text", mxCreateString(outcome.message()));
    mxArray* const texts = mxCreateCellMatrix(1, static_cast<mwSize>(warnings.size()));
    for (std::size_t i = 0; i < warnings.size(); ++i) {
        mxSetCell(texts, static_cast<mwIndex>(i), mxCreateString(warnings[i].c_str()));
    }
    mxSetField(problem, 0, "warnings", texts);
    return problem;
}

Results run(Arguments arguments) {
    Results results{};
    std::vector<std::string> warnings;
    const Outcome outcome = guarded([&] {
        const std::string command = !arguments.empty() && mxIsChar(arguments[0]) ? textOf(arguments[0]) : "";
        if (command == "decode") {
            decode(results, arguments.subspan(1), warnings);
        } else if (command == "encode" && arguments.size() == 2 && mxIsUint8(arguments[1])) {
            encode(results, arguments[1]);
        } else if (command == "quantise" && arguments.size() == 3) {
            quantise(results, arguments[1], arguments[2]);
        } else if (arguments.empty() || !runLte(results, command, arguments.subspan(1))) {
            throw BindingError(Fault::value, "quarzel_mex is not to be called directly; see quarzel_decode");
        }
    });
    results[0] = problemOf(outcome, warnings);
    return results;
}

}  // namespace

extern "C" __attribute__((visibility("default"))) void mexFunction(int outputs, mxArray* results[], int count,
                                                                   const mxArray* arguments[]) {
    const Results all = run({arguments, static_cast<std::size_t>(count)});
    for (std::size_t i = 0; i < all.size(); ++i) {
        if (static_cast<int>(i) < std::max(outputs, 1)) {
            results[i] = all[i] != nullptr ? all[i] : mxCreateDoubleMatrix(0, 0, mxREAL);
        } else if (all[i] != nullptr) {
            mxDestroyArray(all[i]);
        }
    }
}
