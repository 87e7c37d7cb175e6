// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

namespace quarzel::link {

/// The turbo encoder of LTE (3GPP TS 36.212, section 5.1.3.2) for code blocks of one size.
///
/// Thread rule: `encode` may be called from several threads at once.
class Encoder {
  public:
    /// @param blockSize  K, one of the 188 sizes
    /// @throws std::invalid_argument for any other
    explicit Encoder(std::uint32_t blockSize);

    /// K, the information bits of a block.
    std::size_t blockSize() const { return itsPermutation.size(); }

    /// K + 4, the positions of each of the three streams.
    std::size_t positions() const { return blockSize() + 4; }

    /// Encode a block, or 8 blocks together: bit i of every byte belongs to block i.
    /// @param bits     K information bits, each a byte of 0 or 1; or those of 8 blocks
    /// @param streams  receives 3 (K + 4) code bits of the same form: systematic, parity of the first and
    ///                 parity of the second constituent code. The last 4 positions of each are the tail bits
    ///                 where the standard puts them (section 5.1.3.2.2)
    void encode(const std::uint8_t* bits, std::uint8_t* streams) const;

  private:
    std::vector<std::uint16_t>
        itsPermutation;  ///< the information bit that the second code takes at each step
};

}  // namespace quarzel::link
