// SPDX-License-Identifier: MIT
#include "link/quantised_channel.hpp"

#include <algorithm>
#include <cstring>

#include "link/refinement.hpp"

namespace quarzel::link {

namespace {

constexpr std::size_t groupsAtOnce = 8;
constexpr std::size_t valuesAtOnce = groupsAtOnce * wordsPerGroup * 2;

/// The 16 random bits of a value, as the look-up takes them.
std::uint32_t halfWordOf(const std::uint32_t* words, std::size_t value) {
    constexpr std::size_t half = valuesPerLookUp / 2;
    const std::uint32_t word = words[value / valuesPerLookUp * half + value % half];
    return value % valuesPerLookUp < half ? word & 0xffffU : word >> 16;
}

}  // namespace

QuantisedChannel::QuantisedChannel(const Quantiser& quantiser, Decibels ebN0, CodeRate rate)
    : itsThresholds(channelThresholds(quantiser, ebN0, rate)) {
    makeCells();
}

/// The upper 16 bits of a random number decide its output unless a threshold lies inside the 2^32 numbers
/// that share them.
void QuantisedChannel::makeCells() {
    for (std::size_t cell = 0; cell < cellCount; ++cell) {
        const auto startOf = [cell](std::uint64_t low) {
            return ((static_cast<std::uint64_t>(cell) << 4) + low) << refinementBits;
        };
        const int first = outputOf(startOf(0));
        const int last = outputOf(startOf(16) - 1);
        std::int32_t place = cellNoThreshold;
        if (last == first + 1) {
            // The place where it rises. A threshold at the very start of a range leaves nothing undecided in
            // it; to take it for undecided costs time but gives the same outputs.
            for (std::int32_t low = 0; low < 16; ++low) {
                if (outputOf(startOf(static_cast<std::uint64_t>(low) + 1) - 1) == last) {
                    place = low;
                    break;
                }
            }
        } else if (last > first) {
            place |= cellManyThresholds;
        }
        itsCells[cell] = first * (1 << cellValueShift) + place;
    }
}

int QuantisedChannel::outputOf(std::uint64_t random) const {
    const auto above = std::upper_bound(itsThresholds.begin(), itsThresholds.end(), random);
    return lowestOutput + static_cast<int>(above - itsThresholds.begin());
}

std::int8_t QuantisedChannel::softOf(std::uint64_t random, bool codeBit) const {
    const int output = outputOf(random);
    return static_cast<std::int8_t>(std::min(codeBit ? output : -output, 127));
}

void QuantisedChannel::transmit(const RandomSource& source, const std::uint8_t* codeBits, unsigned lane,
                                std::size_t count, std::int8_t* soft) const {
    const DrawFunctions& draw = drawFunctions();
    std::array<std::uint32_t, groupsAtOnce * wordsPerGroup> words;
    std::array<std::uint8_t, valuesAtOnce> isUndecided;
    std::array<std::uint8_t, valuesPerLookUp> lastBits{};
    std::array<std::int8_t, valuesPerLookUp> lastSoft;
    Refinement refinement(source, Purpose::refinement);
    for (std::size_t start = 0; start < count; start += valuesAtOnce) {
        const std::size_t size = std::min(valuesAtOnce, count - start);
        source.words(Purpose::noise, static_cast<std::uint32_t>(start / (2 * wordsPerGroup)),
                     (size + 2 * wordsPerGroup - 1) / (2 * wordsPerGroup), words.data());
        const std::size_t times = size / valuesPerLookUp;
        const std::size_t rest = size % valuesPerLookUp;
        draw.lookUp(words.data(), codeBits + start, lane, itsCells.data(), times, soft + start,
                    isUndecided.data());
        if (rest != 0) {
            const std::size_t at = times * valuesPerLookUp;
            std::copy_n(codeBits + start + at, rest, lastBits.begin());
            draw.lookUp(words.data() + times * (valuesPerLookUp / 2), lastBits.data(), lane, itsCells.data(),
                        1, lastSoft.data(), isUndecided.data() + at);
            std::copy_n(lastSoft.begin(), rest, soft + start + at);
        }
        for (std::size_t i = 0; i < size; i += 8) {
            std::uint64_t any = 0;
            std::memcpy(&any, isUndecided.data() + i, 8);
            for (std::size_t j = i; any != 0 && j < std::min(i + 8, size); ++j) {
                if (isUndecided[j] != 0) {
                    const std::size_t at = start + j;
                    const std::uint64_t random =
                        std::uint64_t{halfWordOf(words.data(), j)} << refinementBits | refinement.next();
                    soft[at] = softOf(random, (codeBits[at] >> lane & 1U) != 0);
                }
            }
        }
    }
}

double QuantisedChannel::probability(int soft, bool codeBit) const {
    constexpr double unit = 1.0 / static_cast<double>(std::uint64_t{1} << channelBits);
    const auto below = [this](int output) -> double {  // of an output for code bit 1
        if (output <= lowestOutput) {
            return 0;
        }
        return output > highestOutput
                   ? 1
                   : static_cast<double>(itsThresholds[static_cast<std::size_t>(output - lowestOutput - 1)]) *
                         unit;
    };
    const int first = codeBit ? soft : (soft == 127 ? lowestOutput : -soft);
    const int last = codeBit ? (soft == 127 ? highestOutput : soft) : -soft;
    return below(last + 1) - below(first);
}

}  // namespace quarzel::link
