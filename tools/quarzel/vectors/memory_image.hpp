// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <istream>
#include <string>
#include <vector>

namespace quarzel::tool {

/// A word of a simulated memory.
struct MemoryWord {
    /// What a simulation can know of a word: nothing, its value, or that it is undefined (x) or undriven (z).
    enum class Kind : std::uint8_t { missing, known, x, z };

    Kind kind = Kind::missing;
    std::uint32_t value = 0;  ///< when it is known
    std::size_t line = 0;     ///< line of the file, from 1; 0 where the file has none
};

/// The first words of a simulated memory, by address.
struct MemoryImage {
    std::vector<MemoryWord> words;
    std::size_t beyond = 0;  ///< words that the file has at further addresses
};

/// Read a text as $writememh makes and $readmemh takes it: hexadecimal words, x and z digits, underscores,
/// addresses (@hex), comments of both kinds. A word at an address that has one already replaces it.
/// @param size  addresses of interest; memory is taken for these alone, whatever the text holds
/// @param file  the name for error messages
/// @throws ToolError naming the line that is not well-formed
MemoryImage readMemoryText(std::istream& stream, std::size_t size, const std::string& file);

/// Read the elements of an npy file of truth values or integers, in C order, as words of a memory.
/// @param size        as above
/// @param packedSize  a two-dimensional array of uint8 with this many columns holds 8 words of a bit in each
///                    element, the first one highest; 0: none does
/// @throws ToolError when the file is not well-formed or holds something else
MemoryImage readMemoryNpy(std::istream& stream, std::size_t size, std::size_t packedSize,
                          const std::string& file);

}  // namespace quarzel::tool
