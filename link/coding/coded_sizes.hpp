// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

/// The sizes of rate matching (3GPP TS 36.212, section 5.1.4.1.2). All functions are pure.
namespace quarzel::link {

/// What a receiver's memory allows, in the standard's names (TS 36.306 has N_soft for each category).
struct SoftMemory {
    std::size_t Nsoft;        ///< soft channel bits in all
    std::size_t KC = 1;       ///< 5, 2 or 1, by N_soft and layers
    std::size_t KMIMO = 1;    ///< transport blocks of a transmission: 1 or 2
    std::size_t Mdlharq = 8;  ///< HARQ processes
    std::size_t Mlimit = 8;
};

/// N_IR, the soft bits for a transport block.
/// @throws std::invalid_argument when any of them is 0
std::size_t softBits(const SoftMemory& memory);

/// K_w, the entries of a whole circular buffer for code blocks of K bits, dummies included.
std::size_t wholeBufferSize(std::uint32_t K);

/// N_cb, the entries of the circular buffer of a code block: limited for a downlink channel.
/// @param C    code blocks
/// @param NIR  soft bits for the transport block
/// @throws std::invalid_argument when there is no block
std::size_t bufferSize(std::uint32_t K, std::size_t C, std::size_t NIR);

/// E of each code block, in order. Their sum is G.
/// @param C       code blocks
/// @param G       coded bits of the transport block
/// @param layers  N_L; 2 for transmit diversity
/// @param Qm      bits of a symbol
/// @throws std::invalid_argument when G is not a multiple of N_L Q_m, or leaves a block without bits; it
/// names the
///         sizes next to it that fit
std::vector<std::size_t> codedSizes(std::size_t C, std::size_t G, unsigned layers, unsigned Qm);

}  // namespace quarzel::link
