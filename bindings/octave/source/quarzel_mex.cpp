// SPDX-License-Identifier: MIT
// The function behind quarzel_decode and quarzel_encode, over the C API that Octave and MATLAB share:
//
//   answer = quarzel_mex('decode', sys, par1, par2, iterations, units, algorithm, tag_width, tags, passes)
//   answer = quarzel_mex('encode', bits)
//
// It never raises an error, which would leave C++ by a jump: `answer.fault` names what went wrong, and the
// functions that users call raise it. They have checked that numbers are whole and in the range of an int.
#include <mex.h>

#include <algorithm>
#include <array>
#include <cstdint>
#include <string>
#include <vector>

#include "common/encoding.hpp"
#include "common/host_core.hpp"
#include "mex_blocks.hpp"

namespace {

using quarzel::bindings::BindingError;
using quarzel::bindings::Fault;
using quarzel::bindings::guarded;
using quarzel::bindings::HostCore;
using quarzel::bindings::Outcome;
using quarzel::octave::MexBlocks;

constexpr std::array<const char*, 6> answerFields = {"fault", "text", "warnings", "bits", "tags", "trace"};

/// The part of an error's identifier that tells its kind.
const char* nameOf(Fault fault) {
    switch (fault) {
        case Fault::none:
            return "";
        case Fault::type:
            return "type";
        case Fault::value:
            return "value";
        case Fault::memory:
            return "memory";
        default:
            return "model";
    }
}

int wholeNumber(const mxArray* array) {
    return static_cast<int>(mxGetScalar(array));
}

std::string textOf(const mxArray* array) {
    std::vector<char> text(mxGetNumberOfElements(array) + 1);
    mxGetString(array, text.data(), static_cast<mwSize>(text.size()));
    return text.data();
}

/// Throw what went wrong inside.
void check(const Outcome& outcome) {
    if (!outcome.done()) {
        throw BindingError(outcome.fault, outcome.message());
    }
}

/// The tags of the caller, one for each block; zeros when there are none.
std::vector<unsigned> tagsOf(const mxArray* from, std::size_t blocks) {
    const std::size_t count = mxGetNumberOfElements(from);
    if (count == 0) {
        return std::vector<unsigned>(blocks);
    }
    if (count != blocks) {
        throw BindingError(Fault::value, "there are " + std::to_string(count) + " tags for " +
                                             std::to_string(blocks) + " blocks; give one tag a block");
    }
    const auto* const tags = static_cast<const std::uint32_t*>(mxGetData(from));
    return {tags, tags + count};
}

void decode(mxArray* answer, const mxArray* const* arguments, std::vector<std::string>& warnings) {
    const MexBlocks blocks({arguments[0], arguments[1], arguments[2]});
    mxSetField(answer, 0, "bits", blocks.bits());
    std::vector<unsigned> tags = tagsOf(arguments[7], blocks.count());
    const int iterations = wholeNumber(arguments[3]);
    const int algorithm = mxIsChar(arguments[5]) ? quarzel::bindings::algorithmOf(textOf(arguments[5]))
                                                 : wholeNumber(arguments[5]);
    HostCore core;
    check(core.open({wholeNumber(arguments[4]), algorithm, wholeNumber(arguments[6])}));
    const int passes = wholeNumber(arguments[8]);
    Outcome outcome = passes == 0 ? blocks.decode(core, iterations, tags)
                                  : blocks.trace(core, iterations, tags, static_cast<unsigned>(passes));
    warnings.swap(outcome.warnings);
    check(outcome);
    if (passes != 0) {
        mxSetField(answer, 0, "trace", mxCreateString(outcome.trace.c_str()));
    }
    mxArray* const tagsBack =
        mxCreateNumericMatrix(1, static_cast<mwSize>(tags.size()), mxUINT32_CLASS, mxREAL);
    std::copy(tags.begin(), tags.end(), static_cast<std::uint32_t*>(mxGetData(tagsBack)));
    mxSetField(answer, 0, "tags", tagsBack);
}

/// The columns of a uint8 matrix, encoded: (K + 4) x 3 x blocks.
void encode(mxArray* answer, const mxArray* bits) {
    const std::size_t K = mxGetM(bits);
    const std::size_t blocks = mxGetN(bits);
    const std::array<mwSize, 3> shape = {static_cast<mwSize>(K + quarzel::tailPositions), 3,
                                         static_cast<mwSize>(blocks)};
    mxArray* const code = mxCreateNumericArray(3, shape.data(), mxUINT8_CLASS, mxREAL);
    mxSetField(answer, 0, "bits", code);
    check(quarzel::bindings::encode(static_cast<const std::uint8_t*>(mxGetData(bits)), K, blocks,
                                    static_cast<std::uint8_t*>(mxGetData(code))));
}

mxArray* run(int count, const mxArray* const* arguments) noexcept {
    mxArray* const answer = mxCreateStructMatrix(1, 1, static_cast<int>(answerFields.size()),
                                                 const_cast<const char**>(answerFields.data()));
    std::vector<std::string> warnings;
    const Outcome outcome = guarded([&] {
        const std::string command = count > 0 && mxIsChar(arguments[0]) ? textOf(arguments[0]) : "";
        if (command == "decode" && count == 10) {
            decode(answer, arguments + 1, warnings);
        } else if (command == "encode" && count == 2 && mxIsUint8(arguments[1])) {
            encode(answer, arguments[1]);
        } else {
            throw BindingError(Fault::value, "quarzel_mex is not to be called directly; see quarzel_decode");
        }
    });
    mxSetField(answer, 0, "fault", mxCreateString(nameOf(outcome.fault)));
    mxSetField(answer, 0, "text", mxCreateString(outcome.message()));
    mxArray* const texts = mxCreateCellMatrix(1, static_cast<mwSize>(warnings.size()));
    for (std::size_t i = 0; i < warnings.size(); ++i) {
        mxSetCell(texts, static_cast<mwIndex>(i), mxCreateString(warnings[i].c_str()));
    }
    mxSetField(answer, 0, "warnings", texts);
    return answer;
}

}  // namespace

extern "C" __attribute__((visibility("default"))) void mexFunction(int /*outputs*/, mxArray* results[],
                                                                   int count, const mxArray* arguments[]) {
    results[0] = run(count, arguments);
}
