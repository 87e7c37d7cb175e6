// SPDX-License-Identifier: MIT
#include "vectors/decision_comparison.hpp"

namespace quarzel::tool {

DecisionComparison compareDecisions(const ExpectedDecisions& expected, const MemoryImage& actual) {
    DecisionComparison comparison;
    comparison.beyond = actual.beyond;
    for (std::size_t block = 0; block < expected.blocks.size(); ++block) {
        const ExpectedBlock& place = expected.blocks[block];
        const std::size_t before = comparison.bits();
        for (std::size_t bit = 0; bit < place.blockSize; ++bit) {
            const MemoryWord& word = actual.words[place.firstBit + bit];
            switch (word.kind) {
                case MemoryWord::Kind::missing:
                    ++comparison.missing;
                    break;
                case MemoryWord::Kind::known:
                    comparison.wrong += word.value != expected.bits[place.firstBit + bit] ? 1 : 0;
                    break;
                case MemoryWord::Kind::x:
                    ++comparison.undefined;
                    break;
                case MemoryWord::Kind::z:
                    ++comparison.undriven;
                    break;
            }
            if (!comparison.first && comparison.bits() > 0) {
                comparison.first = {block, bit};
            }
        }
        comparison.blocks += comparison.bits() > before ? 1 : 0;
    }
    return comparison;
}

}  // namespace quarzel::tool
