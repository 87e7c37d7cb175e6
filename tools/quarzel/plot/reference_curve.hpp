// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <istream>
#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace quarzel::tool {

/// Points of a curve: Eb/N0 in dB and an error rate.
using RatePoints = std::vector<std::pair<double, double>>;

/// Error rates from elsewhere, to be drawn beside measured ones.
struct ReferenceCurve {
    std::string label;
    std::optional<std::uint32_t> blockSize;  ///< K, where the file has it
    std::optional<double> bitsPerSymbol;     ///< information bits a symbol, where the file tells it
    RatePoints ber;                          ///< may be empty
    RatePoints bler;                         ///< may be empty
};

/// Read reference curves: CSV with a header that names ebn0_db and the rates ber and bler, or the counts
/// blocks, bit_errors and block_errors, of which one is enough. An empty field, or a count of 0, is no point.
/// Rows that differ in source, K, code_bits, channel, modulation, decoder or iterations, where the file has
/// these, are points of different curves.
/// @param label  of a file with one curve; where it has more, what tells them apart follows
/// @param file   its name, for error messages
/// @throws ToolError when it is not well-formed
std::vector<ReferenceCurve> readReferenceCurves(std::istream& stream, const std::string& label,
                                                const std::string& file);

/// The same of the file that an argument names.
/// @param argument  "LABEL=FILE", or a file whose name without its ending is the label
/// @throws ToolError when it cannot be read or is not well-formed
std::vector<ReferenceCurve> readReferenceCurves(const std::string& argument);

}  // namespace quarzel::tool
