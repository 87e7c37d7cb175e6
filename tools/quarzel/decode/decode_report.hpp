// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <ostream>
#include <string>

#include "captures/bits_file.hpp"
#include "options/core_options.hpp"

namespace quarzel::tool {

/// What `quarzel decode` tells in the end.
struct DecodeReport {
    std::string capture;
    std::uint32_t blockSize;
    CoreOptions core;
    std::size_t blocks;
    double seconds;                   ///< time that decoding took
    std::optional<BitErrors> errors;  ///< when there was a reference
};

void printText(std::ostream& stream, const DecodeReport& report);

/// One JSON object on a line of its own.
void printJson(std::ostream& stream, const DecodeReport& report);

}  // namespace quarzel::tool
