// SPDX-License-Identifier: MIT
#include "mex_blocks.hpp"

#include <algorithm>
#include <cstddef>
#include <limits>
#include <string>

namespace quarzel::octave {

using bindings::ArrayBlocks;
using bindings::BindingError;
using bindings::Fault;
using Streams = std::array<const mxArray*, 3>;

namespace {

mxClassID typeOf(const mxArray* array) {
    if (mxIsSparse(array) || mxIsComplex(array)) {
        throw BindingError(Fault::type, "soft values must be real and full; use full(real(x))");
    }
    const mxClassID type = mxGetClassID(array);
    if (type != mxINT8_CLASS && type != mxINT16_CLASS && type != mxINT32_CLASS && type != mxDOUBLE_CLASS) {
        throw BindingError(Fault::type,
                           std::string("soft values must be int8, int16, int32 or whole doubles, not ") +
                               mxGetClassName(array) +
                               "; quantise log-likelihood ratios first: quarzel_quantise (llr)");
    }
    return type;
}

bool sameShape(const mxArray* first, const mxArray* second) {
    return mxGetNumberOfDimensions(first) == 2 && mxGetNumberOfDimensions(second) == 2 &&
           mxGetM(first) == mxGetM(second) && mxGetN(first) == mxGetN(second);
}

/// A soft value as int16. What lies outside of that is saturated by the core anyway.
std::int16_t wholeNumber(double value) {
    // A NaN fails the comparisons.
    if (value >= std::numeric_limits<int>::min() && value <= std::numeric_limits<int>::max()) {
        const int whole = static_cast<int>(value);
        if (whole == value) {
            return static_cast<std::int16_t>(std::clamp<int>(whole, std::numeric_limits<std::int16_t>::min(),
                                                             std::numeric_limits<std::int16_t>::max()));
        }
    }
    throw BindingError(Fault::value,
                       "a soft value is not a whole number of the unit 1/8; quantise log-likelihood ratios "
                       "first: quarzel_quantise (llr)");
}

template <SoftValue Value>
ArrayBlocks blocksOf(const Value* systematic, const Value* parity1, const Value* parity2, std::size_t count,
                     std::size_t positions) {
    return SoftBlocks<Value>{systematic, parity1,   parity2,
                             count,      positions, static_cast<std::ptrdiff_t>(positions)};
}

template <SoftValue Value>
ArrayBlocks blocksOf(const Streams& streams, std::size_t count, std::size_t positions) {
    const auto at = [](const mxArray* array) { return static_cast<const Value*>(mxGetData(array)); };
    return blocksOf(at(streams[0]), at(streams[1]), at(streams[2]), count, positions);
}

std::size_t countOf(const ArrayBlocks& blocks) {
    return std::visit([](const auto& array) { return array.count; }, blocks);
}

}  // namespace

MexBlocks::MexBlocks(const Streams& streams) : itsBits(nullptr) {
    if (!mxIsCell(streams[0])) {
        itsBits = addMatrix(streams);
        return;
    }
    for (const mxArray* const stream : streams) {
        if (!mxIsCell(stream) || !sameShape(stream, streams[0])) {
            throw BindingError(Fault::value,
                               "the three streams must be cell arrays of one size, or none of them");
        }
    }
    itsBits =
        mxCreateCellMatrix(static_cast<mwSize>(mxGetM(streams[0])), static_cast<mwSize>(mxGetN(streams[0])));
    for (std::size_t i = 0; i < mxGetNumberOfElements(streams[0]); ++i) {
        Streams cell{};
        std::transform(streams.begin(), streams.end(), cell.begin(),
                       [i](const mxArray* stream) { return mxGetCell(stream, static_cast<mwIndex>(i)); });
        const bool empty =
            std::any_of(cell.begin(), cell.end(), [](const mxArray* array) { return array == nullptr; });
        if (empty || (mxGetM(cell[0]) != 1 && mxGetN(cell[0]) != 1)) {
            throw BindingError(Fault::value, "cell " + std::to_string(i + 1) +
                                                 " must hold one block, a vector of K + 4 values");
        }
        mxSetCell(itsBits, static_cast<mwIndex>(i), addMatrix(cell));
    }
}

mxArray* MexBlocks::addMatrix(const Streams& streams) {
    const mxClassID type = typeOf(streams[0]);
    for (const mxArray* const stream : streams) {
        if (typeOf(stream) != type || !sameShape(stream, streams[0])) {
            throw BindingError(Fault::value, "the three streams must be of one class and size");
        }
    }
    const bool isRow = mxGetM(streams[0]) == 1;
    const std::size_t positions = isRow ? mxGetN(streams[0]) : mxGetM(streams[0]);
    const std::size_t count = isRow ? 1 : mxGetN(streams[0]);
    const std::size_t K = bindings::blockSizeOf(positions);
    const auto rows = static_cast<mwSize>(isRow ? 1 : K);
    const auto columns = static_cast<mwSize>(isRow ? K : count);
    mxArray* const bits = mxCreateNumericMatrix(rows, columns, mxUINT8_CLASS, mxREAL);
    Matrix& matrix = itsMatrices.emplace_back();
    matrix.bits = {static_cast<unsigned char*>(mxGetData(bits)), count * K};
    if (type == mxINT8_CLASS) {
        matrix.blocks = blocksOf<std::int8_t>(streams, count, positions);
    } else if (type == mxINT16_CLASS) {
        matrix.blocks = blocksOf<std::int16_t>(streams, count, positions);
    } else if (type == mxINT32_CLASS) {
        matrix.blocks = blocksOf<std::int32_t>(streams, count, positions);
    } else {
        const std::size_t values = count * positions;
        std::vector<std::int16_t>& wholes = itsWholes.emplace_back(3 * values);
        std::int16_t* next = wholes.data();
        for (const mxArray* const stream : streams) {
            const auto* const reals = static_cast<const double*>(mxGetData(stream));
            next = std::transform(reals, reals + values, next, wholeNumber);
        }
        const std::int16_t* const first = wholes.data();
        matrix.blocks = blocksOf(first, first + values, first + 2 * values, count, positions);
    }
    return bits;
}

std::size_t MexBlocks::count() const {
    std::size_t count = 0;
    for (const Matrix& matrix : itsMatrices) {
        count += countOf(matrix.blocks);
    }
    return count;
}

bindings::Outcome MexBlocks::decode(bindings::HostCore& core, int iterations, std::span<unsigned> tags,
                                    const bindings::HostCore::Interrupted& interrupted) const {
    if (itsMatrices.size() == 1) {
        return core.decode({itsMatrices[0].blocks, iterations, itsMatrices[0].bits, tags}, interrupted);
    }
    // Blocks of several sizes and classes: a record for each, over ints.
    std::vector<std::vector<int>> ints;
    std::vector<vardel_ip_quarzel_inputs> inputs;
    std::vector<vardel_ip_quarzel_outputs> outputs;
    for (const Matrix& matrix : itsMatrices) {
        std::vector<int>& values = ints.emplace_back();
        const std::size_t positions = matrix.bits.size() + tailPositions;
        std::visit(
            [&](const auto& block) {
                for (const auto* const stream : {block.systematic, block.parity1, block.parity2}) {
                    values.insert(values.end(), stream, stream + positions);
                }
            },
            matrix.blocks);
        inputs.push_back({values.data(), values.data() + positions, values.data() + 2 * positions,
                          static_cast<int>(positions), iterations, tags[inputs.size()]});
        outputs.push_back({matrix.bits.data(), static_cast<int>(matrix.bits.size()), 0, 0});
    }
    bindings::Outcome outcome = core.decodeBatch(inputs, outputs, interrupted);
    std::transform(outputs.begin(), outputs.end(), tags.begin(),
                   [](const vardel_ip_quarzel_outputs& output) { return output.tag; });
    return outcome;
}

bindings::Outcome MexBlocks::trace(bindings::HostCore& core, int iterations, std::span<unsigned> tags,
                                   unsigned passes) const {
    if (count() != 1) {
        throw BindingError(Fault::value, "a trace shows one block; decode the others without one");
    }
    return core.traceText({itsMatrices[0].blocks, iterations, itsMatrices[0].bits, tags}, passes);
}

}  // namespace quarzel::octave
