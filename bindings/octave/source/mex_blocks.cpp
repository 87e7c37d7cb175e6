// SPDX-License-Identifier: MIT
#include "mex_blocks.hpp"

#include <algorithm>
#include <cstddef>
#include <string>

#include "common/core.hpp"

namespace quarzel::octave {

using bindings::BindingError;
using bindings::Fault;
using bindings::SoftType;

namespace {

SoftType typeOf(const mxArray* array) {
    if (mxIsSparse(array) || mxIsComplex(array)) {
        throw BindingError(Fault::type, "soft values must be real and full; use full(real(x))");
    }
    switch (mxGetClassID(array)) {
        case mxINT8_CLASS:
            return SoftType::int8;
        case mxINT16_CLASS:
            return SoftType::int16;
        case mxINT32_CLASS:
            return SoftType::int32;
        case mxDOUBLE_CLASS:
            return SoftType::float64;
        default:
            throw BindingError(Fault::type,
                               std::string("soft values must be int8, int16, int32 or whole doubles, not ") +
                                   mxGetClassName(array) + "; for instance int8(round(8 * llr))");
    }
}

bool sameShape(const mxArray* first, const mxArray* second) {
    return mxGetNumberOfDimensions(first) == 2 && mxGetNumberOfDimensions(second) == 2 &&
           mxGetM(first) == mxGetM(second) && mxGetN(first) == mxGetN(second);
}

const void* valuesAt(const mxArray* array, std::size_t index) {
    return static_cast<const std::byte*>(mxGetData(array)) + index * mxGetElementSize(array);
}

}  // namespace

MexBlocks::MexBlocks(const std::array<const mxArray*, 3>& streams) : itsBits(nullptr) {
    if (!mxIsCell(streams[0])) {
        itsBits = addNumbers(streams);
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
        std::array<const mxArray*, 3> cell{};
        std::transform(streams.begin(), streams.end(), cell.begin(),
                       [i](const mxArray* stream) { return mxGetCell(stream, static_cast<mwIndex>(i)); });
        const bool empty =
            std::any_of(cell.begin(), cell.end(), [](const mxArray* array) { return array == nullptr; });
        if (empty || (mxGetM(cell[0]) != 1 && mxGetN(cell[0]) != 1)) {
            throw BindingError(Fault::value, "cell " + std::to_string(i + 1) +
                                                 " must hold one block, a vector of K + 4 values");
        }
        mxSetCell(itsBits, static_cast<mwIndex>(i), addNumbers(cell));
    }
}

mxArray* MexBlocks::addNumbers(const std::array<const mxArray*, 3>& streams) {
    const SoftType type = typeOf(streams[0]);
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
    for (std::size_t i = 0; i < count; ++i) {
        const std::size_t at = i * positions;
        itsBlocks.push_back({{valuesAt(streams[0], at), valuesAt(streams[1], at), valuesAt(streams[2], at)},
                             type,
                             positions,
                             static_cast<unsigned char*>(mxGetData(bits)) + i * K});
    }
    return bits;
}

}  // namespace quarzel::octave
