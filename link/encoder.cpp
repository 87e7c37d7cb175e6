// SPDX-License-Identifier: MIT
#include "link/encoder.hpp"

#include <algorithm>
#include <array>
#include <stdexcept>
#include <string>

#include "link/size_table.hpp"

namespace quarzel::link {

namespace {

/// The three delay elements of the constituent encoder, transfer function [1, (1 + D + D^3) / (1 + D^2 +
/// D^3)], for both codes at once: the bits of the first are in the lower byte, those of the second in the
/// upper.
class ConstituentEncoders {
  public:
    /// The parity bits of the next information bits.
    std::uint32_t parity(std::uint32_t bits) {
        const std::uint32_t feedback = bits ^ itsDelay2 ^ itsDelay3;
        const std::uint32_t parityBits = feedback ^ itsDelay1 ^ itsDelay3;
        shift(feedback);
        return parityBits;
    }

    struct TailBits {
        std::array<std::uint32_t, 3> systematic;
        std::array<std::uint32_t, 3> parity;
    };

    /// The bits of the three steps that lead back to state 0: the feedback is the input.
    TailBits terminate() {
        TailBits tail{};
        for (std::size_t step = 0; step < 3; ++step) {
            tail.systematic[step] = itsDelay2 ^ itsDelay3;
            tail.parity[step] = itsDelay1 ^ itsDelay3;
            shift(0);
        }
        return tail;
    }

  private:
    void shift(std::uint32_t bits) {
        itsDelay3 = itsDelay2;
        itsDelay2 = itsDelay1;
        itsDelay1 = bits;
    }

    std::uint32_t itsDelay1 = 0;
    std::uint32_t itsDelay2 = 0;
    std::uint32_t itsDelay3 = 0;
};

}  // namespace

Encoder::Encoder(std::uint32_t blockSize) {
    const std::vector<unsigned> table = permutation(checkedBlockSize(blockSize));
    itsPermutation.assign(table.begin(), table.end());
}

void Encoder::encode(const std::uint8_t* bits, std::uint8_t* streams) const {
    const std::size_t K = blockSize();
    std::uint8_t* const systematic = streams;
    std::uint8_t* const parity1 = streams + positions();
    std::uint8_t* const parity2 = streams + 2 * positions();
    const std::uint16_t* const permutation = itsPermutation.data();
    ConstituentEncoders encoders;
    std::copy_n(bits, K, systematic);
    for (std::size_t i = 0; i < K; ++i) {
        const std::uint32_t parity = encoders.parity(bits[i] | std::uint32_t{bits[permutation[i]]} << 8);
        parity1[i] = static_cast<std::uint8_t>(parity);
        parity2[i] = static_cast<std::uint8_t>(parity >> 8);
    }
    // The tail of the first code fills two positions of all three streams, that of the second the next two.
    const auto [x, z] = encoders.terminate();
    for (const std::size_t code : {0U, 1U}) {
        const std::size_t at = K + 2 * code;
        const auto bitsOf = [code](std::uint32_t both) {
            return static_cast<std::uint8_t>(both >> 8 * code);
        };
        systematic[at] = bitsOf(x[0]);
        parity1[at] = bitsOf(z[0]);
        parity2[at] = bitsOf(x[1]);
        systematic[at + 1] = bitsOf(z[1]);
        parity1[at + 1] = bitsOf(x[2]);
        parity2[at + 1] = bitsOf(z[2]);
    }
}

}  // namespace quarzel::link
