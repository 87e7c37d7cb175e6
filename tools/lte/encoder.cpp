// SPDX-License-Identifier: MIT
#include "encoder.hpp"

#include <array>
#include <stdexcept>
#include <string>

#include "size_table.hpp"

namespace quarzel::lte {

namespace {

/// The three delay elements of the constituent encoder, transfer function [1, (1 + D + D^3) / (1 + D^2 +
/// D^3)].
class ConstituentEncoder {
  public:
    /// The parity bit of the next information bit.
    std::uint8_t parity(std::uint8_t bit) {
        const std::uint8_t feedback = bit ^ itsDelay2 ^ itsDelay3;
        const std::uint8_t parityBit = feedback ^ itsDelay1 ^ itsDelay3;
        shift(feedback);
        return parityBit;
    }

    struct TailBits {
        std::array<std::uint8_t, 3> systematic;
        std::array<std::uint8_t, 3> parity;
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
    void shift(std::uint8_t bit) {
        itsDelay3 = itsDelay2;
        itsDelay2 = itsDelay1;
        itsDelay1 = bit;
    }

    std::uint8_t itsDelay1 = 0;
    std::uint8_t itsDelay2 = 0;
    std::uint8_t itsDelay3 = 0;
};

const LteParams& paramsOf(std::uint32_t blockSize) {
    if (const LteParams* const row = findBlockSize(blockSize)) {
        return *row;
    }
    throw std::invalid_argument("LTE has no code block of " + std::to_string(blockSize) +
                                " bits; the nearest sizes: " + nearestBlockSizesText(blockSize));
}

}  // namespace

Encoder::Encoder(std::uint32_t blockSize) {
    const LteParams& params = paramsOf(blockSize);
    itsPermutation.reserve(blockSize);
    for (std::uint64_t i = 0; i < blockSize; ++i) {
        itsPermutation.push_back(static_cast<std::uint16_t>((params.f1 * i + params.f2 * i * i) % blockSize));
    }
}

void Encoder::encode(const std::uint8_t* bits, std::uint8_t* streams) const {
    const std::size_t K = blockSize();
    std::uint8_t* const systematic = streams;
    std::uint8_t* const parity1 = streams + positions();
    std::uint8_t* const parity2 = streams + 2 * positions();
    ConstituentEncoder first;
    ConstituentEncoder second;
    for (std::size_t i = 0; i < K; ++i) {
        systematic[i] = bits[i];
        parity1[i] = first.parity(bits[i]);
        parity2[i] = second.parity(bits[itsPermutation[i]]);
    }
    // The tail of the first code fills two positions of all three streams, that of the second the next two.
    for (ConstituentEncoder* const code : {&first, &second}) {
        const std::size_t at = code == &first ? K : K + 2;
        const auto [x, z] = code->terminate();
        systematic[at] = x[0];
        parity1[at] = z[0];
        parity2[at] = x[1];
        systematic[at + 1] = z[1];
        parity1[at + 1] = x[2];
        parity2[at + 1] = z[2];
    }
}

}  // namespace quarzel::lte
