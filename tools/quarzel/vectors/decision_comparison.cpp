// SPDX-License-Identifier: MIT
#include "vectors/decision_comparison.hpp"

namespace quarzel::tool {

bool DifferingBits::add(const MemoryWord& word, std::uint8_t expected) {
    switch (word.kind) {
        case MemoryWord::Kind::missing:
            ++missing;
            return true;
        case MemoryWord::Kind::x:
            ++undefined;
            return true;
        case MemoryWord::Kind::z:
            ++undriven;
            return true;
        case MemoryWord::Kind::known:
            break;
    }
    wrong += word.value != expected ? 1 : 0;
    return word.value != expected;
}

DecisionComparison compareDecisions(const ExpectedDecisions& expected, const MemoryImage& actual) {
    DecisionComparison comparison;
    comparison.beyond = actual.beyond;
    for (std::size_t block = 0; block < expected.blocks.size(); ++block) {
        const ExpectedBlock& place = expected.blocks[block];
        BlockDifference difference{block, 0, {}};
        for (std::size_t bit = 0; bit < place.blockSize; ++bit) {
            const std::size_t address = place.firstBit + bit;
            if (!difference.bits.add(actual.words[address], expected.bits[address])) {
                continue;
            }
            comparison.bits.add(actual.words[address], expected.bits[address]);
            ++comparison.eighths.at(bit * comparison.eighths.size() / place.blockSize);
            if (difference.bits.count() == 1) {
                difference.firstBit = bit;
            }
        }
        if (difference.bits.count() > 0) {
            comparison.failing.push_back(difference);
        }
    }
    return comparison;
}

}  // namespace quarzel::tool
