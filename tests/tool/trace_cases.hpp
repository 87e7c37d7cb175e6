// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <vector>
#include <xtensor/xarray.hpp>

#include "temporary_directory.hpp"

namespace quarzel::test {

/// A stored trace, and what brings it about.
struct TraceCase {
    std::string name;
    int units;
    int algorithm;
    int passes;
    xt::xarray<std::int16_t> soft;  ///< (blocks, 3, K + 4)
    std::string text;

    std::size_t blocks() const { return soft.shape(0); }

    /// Write the soft values to a directory.
    /// @return the arguments that decode them with the trace, one iteration for each block
    std::vector<std::string> decodeFrom(const TemporaryDirectory& directory) const;
};

/// The traces of the stored calls of the C interface.
std::vector<TraceCase> traceCases();

/// The one of two blocks of 40 bits with two passes of the first and one of the second.
TraceCase smallTraceCase();

/// The lines of a text, without their line ends.
std::vector<std::string> linesOf(const std::string& text);

/// A text of these lines.
std::string textOf(const std::vector<std::string>& lines);

/// The words of a line.
std::vector<std::string> wordsOf(const std::string& line);

}  // namespace quarzel::test
