// SPDX-License-Identifier: MIT
#include "frozen/frozen_input.hpp"

#include <Random123/philox.h>

#include <vector>

#include "link/encoder.hpp"

namespace quarzel::test {

namespace {

constexpr int amplitude = 6;

class RandomWords {
  public:
    RandomWords(const FrozenCase& which, FrozenClass kind)
        : itsCounter{{0, which.K, which.units * 16 + which.algorithm, static_cast<std::uint32_t>(kind)}} {}

    std::uint32_t word(std::size_t index) {
        itsCounter.v[0] = static_cast<std::uint32_t>(index / 4);
        const philox4x32_key_t key{{0, 0}};
        return philox4x32(itsCounter, key).v[index % 4];
    }

  private:
    philox4x32_ctr_t itsCounter;
};

/// The sum of the four bytes of a word is close to a normal distribution of mean 510 and deviation 147.8.
int noiseOf(std::uint32_t word) {
    const auto sum = static_cast<int>((word & 255) + (word >> 8 & 255) + (word >> 16 & 255) + (word >> 24));
    return ((sum - 510) * 12) >> 8;
}

int softValue(FrozenClass kind, std::uint32_t word, std::uint8_t codeBit) {
    switch (kind) {
        case FrozenClass::noise:
            return (codeBit != 0 ? amplitude : -amplitude) + noiseOf(word);
        case FrozenClass::fullScale:
            return word >> 31 != 0 ? 127 : -128;
        case FrozenClass::zero:
            return 0;
        case FrozenClass::uniform:
            break;
    }
    return static_cast<int>(word >> 24) - 128;
}

}  // namespace

Block frozenInput(const FrozenCase& which, FrozenClass kind) {
    const std::size_t positions = which.K + 4;
    RandomWords words(which, kind);
    std::vector<std::uint8_t> bits(which.K);
    for (std::size_t i = 0; i < bits.size(); ++i) {
        bits[i] = static_cast<std::uint8_t>(words.word(3 * positions + i) & 1);
    }
    std::vector<std::uint8_t> codeBits(3 * positions);
    link::Encoder(which.K).encode(bits.data(), codeBits.data());
    Block block(positions);
    std::size_t index = 0;
    for (std::vector<int>* stream : {&block.systematic, &block.parity1, &block.parity2}) {
        for (int& value : *stream) {
            value = softValue(kind, words.word(index), codeBits[index]);
            ++index;
        }
    }
    return block;
}

}  // namespace quarzel::test
