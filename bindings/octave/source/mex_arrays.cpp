// SPDX-License-Identifier: MIT
#include "mex_arrays.hpp"

#include <array>
#include <string>

#include "common/outcome.hpp"
#include "decode_options.hpp"

namespace quarzel::octave {

using bindings::BindingError;
using bindings::Fault;
using bindings::Rows;

namespace {

/// Blocks of `blockColumns` columns.
template <class Value>
Rows<const Value> blocksOf(const mxArray* array, mxClassID type, std::size_t blockColumns) {
    if (mxGetClassID(array) != type || mxIsSparse(array) || mxIsComplex(array) ||
        mxGetN(array) % blockColumns != 0) {
        throw BindingError(Fault::type, "quarzel_mex is not to be called directly; see quarzel_decode");
    }
    return {static_cast<const Value*>(mxGetData(array)), mxGetN(array) / blockColumns,
            mxGetM(array) * blockColumns};
}

}  // namespace

Rows<const std::uint8_t> bitColumns(const mxArray* array) {
    return blocksOf<std::uint8_t>(array, mxUINT8_CLASS, 1);
}

Rows<const std::int16_t> softColumns(const mxArray* array) {
    return blocksOf<std::int16_t>(array, mxINT16_CLASS, 1);
}

Rows<const double> realColumns(const mxArray* array) {
    return blocksOf<double>(array, mxDOUBLE_CLASS, 1);
}

Rows<const std::uint8_t> bitPages(const mxArray* array) {
    return blocksOf<std::uint8_t>(array, mxUINT8_CLASS, 3);
}

mxArray* makeColumns(std::size_t size, std::size_t count, mxClassID type) {
    return mxCreateNumericMatrix(static_cast<mwSize>(size), static_cast<mwSize>(count), type, mxREAL);
}

mxArray* makePages(std::size_t positions, std::size_t count, mxClassID type) {
    const std::array<mwSize, 3> shape = {static_cast<mwSize>(positions), 3, static_cast<mwSize>(count)};
    return mxCreateNumericArray(3, shape.data(), type, mxREAL);
}

std::size_t countIn(const mxArray* array, const char* name) {
    const int number = wholeNumber(array, name);
    if (number < 0) {
        throw BindingError(Fault::value,
                           std::string(name) + " must be 0 or more, not " + std::to_string(number));
    }
    return static_cast<std::size_t>(number);
}

}  // namespace quarzel::octave
