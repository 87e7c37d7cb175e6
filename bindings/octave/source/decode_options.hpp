// SPDX-License-Identifier: MIT
#pragma once

#include <mex.h>

#include <span>
#include <string>
#include <vector>

#include "quarzel/core.hpp"

namespace quarzel::octave {

/// What a call of quarzel_decode asks for besides its streams.
struct DecodeOptions {
    int iterations = 6;
    CoreSettings settings;
    std::vector<unsigned> tags;  ///< one for each block; empty: none are given
    unsigned passes = 0;         ///< of the trace
    std::string traceFile;       ///< empty: none
};

/// Read them from the arguments after the streams: the iterations, which may be left out or empty, then names
/// with values or a struct of them.
/// @throws bindings::BindingError when there is something that no option is
DecodeOptions decodeOptions(std::span<const mxArray* const> arguments);

/// Text of a char array; empty for another one.
std::string textOf(const mxArray* array);

/// @throws bindings::BindingError naming what must be a whole number, and is not
int wholeNumber(const mxArray* array, const char* name);

/// The number of an algorithm that is given by its name or number.
/// @throws bindings::BindingError or std::invalid_argument when it is neither
int algorithmIn(const mxArray* array);

}  // namespace quarzel::octave
