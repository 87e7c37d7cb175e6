// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <istream>
#include <string>
#include <vector>

namespace quarzel::tool {

/// A field of the elements of a structured array.
struct NpyField {
    std::string name;
    std::string type;                  ///< as numpy spells it
    std::vector<std::uint64_t> shape;  ///< of the values in an element; empty: one value
};

/// What the header of an npy file says about the array that follows it.
struct NpyHeader {
    std::string
        type;  ///< element type as numpy spells it, "<i2" for example; "record" for a structured array
    bool fortranOrder;
    std::vector<std::uint64_t> shape;
    std::vector<NpyField> fields;  ///< of a structured array
};

/// Whether an input is an npy file: by its name, or by its first byte, with which no text begins.
bool isNpy(std::istream& stream, const std::string& file);

/// Read the header of an npy file and leave the stream at the first element.
///
/// The header is read here rather than by xtensor, whose reader trusts what it is given: it allocates what a
/// broken header asks for and does not notice a file that ends too early.
///
/// @param file  the name for error messages
/// @throws ToolError when the stream does not hold a whole, well-formed header
NpyHeader readNpyHeader(std::istream& stream, const std::string& file);

/// Throw the ToolError that fits unless the array is in C order.
void requireCOrder(const NpyHeader& header, const std::string& file);

/// A shape as numpy prints it: "(24, 3, 6148)".
std::string shapeText(const std::vector<std::uint64_t>& shape);

/// Throw the ToolError that fits unless the stream has reached its end.
void requireEnd(std::istream& stream, const std::string& file);

}  // namespace quarzel::tool
