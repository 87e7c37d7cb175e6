// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <string_view>

#include "link/coding/crc.hpp"
#include "link/coding/segmentation.hpp"
#include "rows.hpp"

/// The coding chain of LTE on arrays of a host, one for each block: the functions of link/coding with the
/// checks that values from outside need. All of them throw std::invalid_argument or BindingError for what
/// does not fit.
namespace quarzel::bindings {

/// The check of a name: crc24a, crc24b, crc16 or crc8.
link::Crc crcOf(std::string_view name);

/// @param parity  receives the parity bits of each block
void findParity(link::Crc crc, Rows<const std::uint8_t> bits, Rows<std::uint8_t> parity);

/// @param blocks  receives `totalSize` values for each array of bits
void segment(const link::Segmentation& segmentation, Rows<const std::uint8_t> bits,
             Rows<std::uint8_t> blocks);

/// Refuse code blocks of other sizes than a segmentation has.
void requireSizes(const link::Segmentation& segmentation, std::span<const std::size_t> sizes);

/// @param bits   receives B bits for each array of blocks
/// @param holds  receives C values for each: 1 where the CRC24B of a code block holds
void desegment(const link::Segmentation& segmentation, Rows<const std::uint8_t> blocks,
               Rows<std::uint8_t> bits, Rows<std::uint8_t> holds);

/// @param streams  receives 3 (K + 4) code bits for each block of K
void turboEncode(Rows<const std::uint8_t> blocks, std::size_t filler, Rows<std::uint8_t> streams);

/// What both directions of rate matching ask for.
struct RateMatchingOptions {
    unsigned rv = 0;
    std::optional<std::size_t> bufferSize;  ///< N_cb; K_w without
    std::size_t filler = 0;                 ///< F
};

/// @param streams  3 (K + 4) code bits for each block
/// @param coded    receives E bits for each
void rateMatch(const RateMatchingOptions& options, Rows<const std::uint8_t> streams,
               Rows<std::uint8_t> coded);

/// @param soft     E values for each block
/// @param width    bits of a sum, 2 to 16
/// @param buffers  N_cb entries of w for each block, to which the values are added; without, nothing was
/// received
///                 before
/// @param streams  receives 3 (K + 4) values for each block of K
void rateRecover(const RateMatchingOptions& options, Rows<const std::int16_t> soft, unsigned width,
                 const std::optional<Rows<std::int16_t>>& buffers, Rows<std::int8_t> streams);

}  // namespace quarzel::bindings
