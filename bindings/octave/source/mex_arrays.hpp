// SPDX-License-Identifier: MIT
#pragma once

#include <mex.h>

#include <cstddef>
#include <cstdint>

#include "common/rows.hpp"

/// Arrays of Octave as blocks: a block lies in each column, or in each page of three columns, and so after
/// one another in memory.
namespace quarzel::octave {

/// The blocks of an argument that has been made by our own functions: full, real, of a class.
/// @throws bindings::BindingError when it is not of that class
bindings::Rows<const std::uint8_t> bitColumns(const mxArray* array);
bindings::Rows<const std::int16_t> softColumns(const mxArray* array);
bindings::Rows<const double> realColumns(const mxArray* array);

/// The same for (K + 4) x 3 x blocks.
bindings::Rows<const std::uint8_t> bitPages(const mxArray* array);

/// An array for `count` blocks of `size` values. It belongs to the caller.
mxArray* makeColumns(std::size_t size, std::size_t count, mxClassID type);

/// An array (K + 4) x 3 x count. It belongs to the caller.
mxArray* makePages(std::size_t positions, std::size_t count, mxClassID type);

/// The blocks of an array that was made with the class of Value.
template <class Value>
bindings::Rows<Value> columnsIn(mxArray* array, std::size_t size, std::size_t count) {
    return {static_cast<Value*>(mxGetData(array)), count, size};
}

/// A whole number of 0 or more.
/// @throws bindings::BindingError naming it
std::size_t countIn(const mxArray* array, const char* name);

}  // namespace quarzel::octave
