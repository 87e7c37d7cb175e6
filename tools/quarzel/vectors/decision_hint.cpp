// SPDX-License-Identifier: MIT
#include "vectors/decision_hint.hpp"

#include <fmt/format.h>

#include <string_view>
#include <unordered_map>

#include "report_text.hpp"

namespace quarzel::tool {

namespace {

constexpr std::size_t fewestWrong = 8;
constexpr std::ptrdiff_t farthestShift = 64;

/// How far an explanation of wrong bits holds.
class Tally {
  public:
    explicit Tally(std::size_t wrong) : itsWrong(wrong) {}

    /// Look at a bit.
    /// @param explanation  what it is to be
    /// @return             whether the explanation may still hold
    bool add(const MemoryWord& word, unsigned expected, unsigned explanation) {
        if (word.kind != MemoryWord::Kind::known) {
            return true;
        }
        itsExplained += word.value == explanation && word.value != expected ? 1 : 0;
        itsDenied += word.value != explanation ? 1 : 0;
        return !denies();
    }

    /// How many wrong bits it explains; 0 when it does not hold.
    std::size_t explained() const { return !denies() && 2 * itsExplained >= itsWrong ? itsExplained : 0; }

  private:
    bool denies() const { return 10 * itsDenied > itsWrong; }

    std::size_t itsWrong;
    std::size_t itsExplained = 0;  ///< wrong bits
    std::size_t itsDenied = 0;
};

/// Compares the decisions with those expected elsewhere.
class Explanations {
  public:
    Explanations(const ExpectedDecisions& expected, const MemoryImage& actual,
                 const DecisionComparison& comparison)
        : itsExpected(expected), itsActual(actual), itsComparison(comparison) {}

    /// Explain the blocks that differ by what is expected at other places of them.
    /// @param placeOf  the place for a bit and K; none where it is not below K
    /// @param flipped  1 when the bits are inverted
    /// @return         how many wrong bits that explains
    template <class PlaceOf>
    std::size_t inBlocks(PlaceOf placeOf, unsigned flipped = 0) const {
        Tally tally(itsComparison.bits.wrong);
        for (const BlockDifference& difference : itsComparison.failing) {
            const ExpectedBlock& block = itsExpected.blocks[difference.block];
            for (std::size_t bit = 0; bit < block.blockSize; ++bit) {
                const std::size_t place = placeOf(bit, std::size_t{block.blockSize});
                const std::size_t at = block.firstBit + bit;
                if (place < block.blockSize &&
                    !tally.add(itsActual.words[at], itsExpected.bits[at],
                               itsExpected.bits[block.firstBit + place] ^ flipped)) {
                    return 0;
                }
            }
        }
        return tally.explained();
    }

    /// Explain all from the first difference on by decisions that are so many bits late, over the ends of
    /// blocks.
    /// @return  how many wrong bits that explains
    std::size_t shifted(std::ptrdiff_t by) const {
        Tally tally(itsComparison.bits.wrong);
        const BlockDifference& first = itsComparison.failing.front();
        for (std::size_t at = itsExpected.blocks[first.block].firstBit + first.firstBit;
             at < itsExpected.bits.size(); ++at) {
            const std::size_t from = at - static_cast<std::size_t>(by);
            if (from < itsExpected.bits.size() &&
                !tally.add(itsActual.words[at], itsExpected.bits[at], itsExpected.bits[from])) {
                return 0;
            }
        }
        return tally.explained();
    }

  private:
    const ExpectedDecisions& itsExpected;
    const MemoryImage& itsActual;
    const DecisionComparison& itsComparison;
};

std::optional<DecisionHint> shiftOf(const Explanations& explanations) {
    for (std::ptrdiff_t distance = 1; distance <= farthestShift; ++distance) {
        for (const std::ptrdiff_t by : {distance, -distance}) {
            const std::size_t inBlocks = explanations.inBlocks(
                [by](std::size_t bit, std::size_t) { return bit - static_cast<std::size_t>(by); });
            const std::size_t throughout = explanations.shifted(by);
            if (inBlocks != 0 || throughout != 0) {
                return DecisionHint{
                    "shifted",
                    fmt::format("{} {} {}",
                                throughout > inBlocks ? "all decisions from the first difference on come"
                                                      : "each block that differs comes",
                                counted(static_cast<std::size_t>(distance), "bit", "bits"),
                                by > 0 ? "late" : "early")};
            }
        }
    }
    return std::nullopt;
}

/// Blocks that hold what is expected of others.
std::optional<DecisionHint> swapOf(const ExpectedDecisions& expected, const MemoryImage& actual,
                                   const DecisionComparison& comparison) {
    std::unordered_map<std::string_view, std::size_t> blockOf;  // by its bits
    const auto* const bytes = reinterpret_cast<const char*>(expected.bits.data());
    for (std::size_t i = 0; i < expected.blocks.size(); ++i) {
        blockOf.emplace(std::string_view(bytes + expected.blocks[i].firstBit, expected.blocks[i].blockSize),
                        i);
    }
    std::size_t found = 0;
    std::string example;
    for (const BlockDifference& difference : comparison.failing) {
        const ExpectedBlock& block = expected.blocks[difference.block];
        std::string bits;
        for (std::size_t bit = 0; bit < block.blockSize; ++bit) {
            const MemoryWord& word = actual.words[block.firstBit + bit];
            bits +=
                word.kind == MemoryWord::Kind::known && word.value <= 1 ? static_cast<char>(word.value) : '?';
        }
        if (const auto other = blockOf.find(bits); other != blockOf.end()) {
            example = example.empty()
                          ? fmt::format("block {} those of block {}", difference.block, other->second)
                          : example;
            ++found;
        }
    }
    if (found < 2 || 10 * (comparison.failing.size() - found) > comparison.failing.size()) {
        return std::nullopt;
    }
    return DecisionHint{"swapped",
                        fmt::format("{} of {} blocks that differ hold the decisions of others, as {}", found,
                                    comparison.failing.size(), example)};
}

}  // namespace

std::optional<DecisionHint> hintOf(const ExpectedDecisions& expected, const MemoryImage& actual,
                                   const DecisionComparison& comparison) {
    if (comparison.bits.wrong < fewestWrong) {
        return std::nullopt;
    }
    const Explanations explanations(expected, actual, comparison);
    if (explanations.inBlocks([](std::size_t bit, std::size_t) { return bit; }, 1) != 0) {
        return DecisionHint{"inverted", "each block that differs is inverted"};
    }
    if (explanations.inBlocks([](std::size_t bit, std::size_t K) { return K - 1 - bit; }) != 0) {
        return DecisionHint{"reversed", "each block that differs comes in reversed order, last bit first"};
    }
    for (const std::size_t group : {8U, 16U, 32U}) {
        if (explanations.inBlocks([group](std::size_t bit, std::size_t) {
                return bit - bit % group + group - 1 - bit % group;
            }) != 0) {
            return DecisionHint{"reversed",
                                fmt::format("each {} bits of the blocks that differ are reversed", group)};
        }
    }
    if (auto shift = shiftOf(explanations)) {
        return shift;
    }
    return swapOf(expected, actual, comparison);
}

}  // namespace quarzel::tool
