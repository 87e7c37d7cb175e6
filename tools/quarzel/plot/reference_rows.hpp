// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstdint>
#include <istream>
#include <optional>
#include <string>
#include <vector>

namespace quarzel::tool {

/// The columns that tell reference curves apart, in the order in which labels name them.
enum ReferenceColumn : std::size_t {
    referenceK,
    referenceDecoder,
    referenceIterations,
    referenceModulation,
    referenceChannel,
    referenceCodeBits,
    referenceSource,
    referenceColumns
};

/// A row of a file of reference curves.
struct ReferenceRow {
    std::array<std::string, referenceColumns> setup;  ///< empty where there is no such column
    double ebN0;                                      ///< in dB
    std::optional<double> ber;                        ///< none where the row has none or saw no error
    std::optional<double> bler;                       ///< likewise
};

/// What a file of reference curves must be, for error messages.
extern const char* const referenceRemedy;

/// Read a field as a whole number above 0, less than 2^32.
/// @throws ToolError when it is anything else
std::uint32_t countFrom(const std::string& field, const std::string& where);

/// Read the rows of reference curves, which `readReferenceCurves` describes.
/// @param file  its name, for error messages
/// @throws ToolError when it is not well-formed
std::vector<ReferenceRow> readReferenceRows(std::istream& stream, const std::string& file);

}  // namespace quarzel::tool
